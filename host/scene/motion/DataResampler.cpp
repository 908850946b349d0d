#include "host/scene/motion/DataResampler.h"

#include <algorithm>
#include <cmath>
#include <iterator>
#include <set>
#include <string>
#include <vector>

#include "host/keys/DataRanges.h"
#include "host/keys/KeyResampling.h"
#include "host/scene/DataEdit.h"
#include "host/scene/Database.h"
#include "host/scene/Devices.h"
#include "host/scene/Editability.h"
#include "host/scene/HTimeManager.h"
#include "host/scene/Marker.h"
#include "host/services/OperationStack.h"

namespace {

class Resampler {
 public:
  Resampler(Database& scene, HFrameRate const& rate, bool selected, bool keepGaps, bool includeUnlabeled)
      : m_scene(scene),
        m_rate(rate),
        m_selected(selected),
        m_keepGaps(keepGaps),
        m_includeUnlabeled(includeUnlabeled) {}

  bool run() {
    planClips();
    // Everything is worked out before anything is stored, so that there is nothing to take back.
    g_theOperationStack.pushTask(0, m_scene.getNumModules(), 0, 1, true, "Resampling");
    bool const done = workOut();
    g_theOperationStack.popTask();
    if (!done) return false;
    store();
    tellLocked();
    return true;
  }

 private:
  // A clip that goes to the rate.
  struct ClipPlan {
    NLEClip* clip;
    int64 formerPeriod;
    double formerSampleRate, sampleRate;  // of devices; 0: none
    HTimeRange frames;                    // the file's new ones; empty: from no file
  };
  struct NewKeys {
    Controller* channel;
    NLEClip* clip;
    int layer;
    KeyTrack keys;
  };

  void planClips() {
    for (NLEClip* clip = m_scene.getHeadClip(); clip; clip = clip->getNext()) {
      if (!clip->holdsKeys()) continue;
      if (clip->isLocked()) {
        m_locked.insert("the clip " + std::string(clip->getName().GetString()));
        continue;
      }
      auto const* taken = objectAs<Clip>(clip);
      Clip::FileTime const file = taken ? taken->getFileTime() : Clip::FileTime();
      int64 const period = clip->getFramePeriod();
      HTimeRange const frames(file.firstFrame * period, (file.firstFrame + file.frameCount - 1) * period);
      m_plans.push_back(
          {clip, period, file.sampleRate, sampleRateFor(file.sampleRate, *clip), framesInside(frames)});
    }
  }

  double sampleRateFor(double former, NLEClip const& clip) const {
    if (!(former > 0)) return 0;
    double const frames = m_rate.getFrameRate(), perFrame = std::round(former / frames);
    if (perFrame >= 1 && std::abs(former - perFrame * frames) < 1e-6 * former) return former;
    double const nearest = std::max(perFrame, 1.0) * frames;
    m_scene.logWarning("%s: analog channels go from %g to %g samples a second, %g a frame",
                       clip.getName().GetStr(), former, nearest, std::max(perFrame, 1.0));
    return nearest;
  }

  bool workOut() {
    for (int i = 0; i < m_scene.getNumModules(); ++i) {
      Module& module = *m_scene.getModule(i);
      bool const wanted = isWanted(module);
      size_t const first = m_new.size();
      for (int k = 0; k < module.getNumChannels(); ++k)
        for (ClipPlan const& plan : m_plans) workOut(*module.getChannel(k), plan, wanted);
      if (auto* marker = objectAs<Marker>(&module); marker && wanted) tellProvenance(*marker, first);
      g_theOperationStack.stepTask();
      if (g_theOperationStack.isCancelled()) return false;
    }
    return true;
  }

  bool isWanted(Module const& module) const {
    auto const* marker = objectAs<Marker>(&module);
    return (!m_selected || module.isSelected()) && (m_includeUnlabeled || !marker || !marker->isUnlabeled());
  }

  void workOut(Controller& channel, ClipPlan const& plan, bool wanted) {
    int64 const former = channel.getDataPeriod(*plan.clip), period = periodFor(plan, former);
    if (former == period) return;
    for (int layer = 0; layer < plan.clip->getNumLayers(); ++layer) {
      KeyTrack const* track = channel.findTrack(plan.clip, layer);
      if (!track || track->empty()) continue;
      if (Obstacle const obstacle = obstacleToKeys(channel, plan.clip, layer); obstacle != Obstacle::none) {
        m_locked.insert(channel.getName().GetString() + " of " + channel.getModule()->getName().GetString());
        continue;
      }
      if (wanted) {
        KeyTrack keys = resampled(*track, {channel.getInterpolation(), former, period, m_keepGaps});
        // Samples after the last frame's would make more frames.
        if (former != plan.formerPeriod && !plan.frames.isEmpty())
          keys.eraseRange(plan.frames.getEnd() + m_rate.getTicksPerFrame(), kForever);
        m_new.push_back({&channel, plan.clip, layer, std::move(keys)});
      } else if (track == channel.findDataTrack(plan.clip)) {
        KeyTrack kept = *track;
        for (unsigned part : {1u, 2u, 4u}) DataRanges(*track, former, part).bridge(kept, part);
        m_new.push_back({&channel, plan.clip, layer, std::move(kept)});
      }
    }
  }

  // Devices may sample faster than cameras.
  int64 periodFor(ClipPlan const& plan, int64 former) const {
    if (former == plan.formerPeriod) return m_rate.getTicksPerFrame();
    return plan.sampleRate == plan.formerSampleRate ? former : ticksPerFrameAt(plan.sampleRate);
  }

  // A marker's new positions are computed ones. `first`: where its new keys begin.
  void tellProvenance(Marker& marker, size_t first) {
    Controller* fillType = marker.getProperty("FillType");
    std::vector<NewKeys> all;
    for (size_t i = first; i < m_new.size(); ++i)
      if (m_new[i].channel != fillType) all.push_back(std::move(m_new[i]));
    m_new.erase(m_new.begin() + static_cast<ptrdiff_t>(first), m_new.end());
    for (ClipPlan const& plan : m_plans) {
      if (obstacleToKeys(*fillType, plan.clip, 0) != Obstacle::none) continue;
      KeyTrack types(KeyTrack::Shape::Scalar);
      for (NewKeys const& made : all)
        if (made.channel == marker.getTranslationChannel() && made.clip == plan.clip && types.empty())
          types = provenanceOf(made.keys);
      if (!types.empty()) all.push_back({fillType, plan.clip, 0, std::move(types)});
    }
    std::move(all.begin(), all.end(), std::back_inserter(m_new));
  }

  KeyTrack provenanceOf(KeyTrack const& positions) const {
    KeyTrack types(KeyTrack::Shape::Scalar);
    if (positions.empty()) return types;
    DataRanges(positions, m_rate.getTicksPerFrame())
        .visitRanges(positions.timeAt(0), positions.timeAt(positions.count() - 1),
                     [&](int64 start, int64 end) {
                       types.set(start, {Marker::Resampled});
                       types.set(end, {Marker::Resampled});
                       types.bridge(start, end - 1);
                     });
    return types;
  }

  void store() {
    for (NewKeys& made : m_new) {
      DataEdit const edit(*made.channel);
      made.channel->setTrack(made.clip, made.layer, std::move(made.keys));
    }
    for (ClipPlan const& plan : m_plans)
      if (auto* clip = objectAs<Clip>(plan.clip); clip && clip->getFileTime().rate > 0)
        storeFileTime(*clip, plan);
    HTimeManager& times = *m_scene.getTimeManager();
    times.setFrameRate(m_rate);
    times.setAnimRange(framesInside(times.getAnimRange()), times.isAnimRangeChosen());
    times.setPlayRange(framesInside(times.getPlayRange()), true);
    std::vector<HTimeRange> ranges;
    for (int i = 0; i < times.getNumSelectedRanges(); ++i) ranges.push_back(times.getSelectedTimeRange(i));
    if (ranges.empty()) return;
    times.clearSelectedTimeRanges();
    for (HTimeRange const& range : ranges) times.addSelectedTimeRange(framesInside(range));
  }

  void storeFileTime(Clip& clip, ClipPlan const& plan) {
    Clip::FileTime time = clip.getFileTime();
    int64 const period = m_rate.getTicksPerFrame();
    if (time.frameCount > 0) {
      time.firstFrame = plan.frames.getStart() / period;
      time.frameCount = plan.frames.getEnd() / period - time.firstFrame + 1;
    }
    time.rate = m_rate.getFrameRate();
    time.sampleRate = plan.sampleRate;
    clip.setFileTime(time);
  }

  // The whole new frames inside a range; of a shorter one the frame nearest to its start.
  HTimeRange framesInside(HTimeRange const& range) const {
    if (range.isEmpty() || range == HTimeRange::forever()) return range;
    int64 const period = m_rate.getTicksPerFrame(), tolerance = period / 1000;
    int64 first = frameAtOrAfter(range.getStart() - tolerance, period);
    int64 last = frameAtOrBefore(range.getEnd() + tolerance, period);
    if (first > last) first = last = frameAtOrBefore(range.getStart() + period / 2, period);
    return {first * period, last * period};
  }

  void tellLocked() const {
    constexpr size_t kNamed = 3;
    std::string names;
    size_t i = 0;
    for (std::string const& name : m_locked)
      if (i++ < kNamed) names += (names.empty() ? "" : ", ") + name;
    if (m_locked.size() > kNamed) names += " and " + std::to_string(m_locked.size() - kNamed) + " more";
    if (!m_locked.empty())
      m_scene.logWarning("What is locked was not resampled and keeps its keys: %s", names.c_str());
  }

  Database& m_scene;
  HFrameRate const& m_rate;
  bool m_selected, m_keepGaps, m_includeUnlabeled;
  std::vector<ClipPlan> m_plans;
  std::vector<NewKeys> m_new;
  std::set<std::string> m_locked;
};

}  // namespace

bool DataResampler::resample(HFrameRate rate, bool selected, bool respectGaps, bool includeUnlabeled) {
  return Resampler(Database::current(), rate, selected, respectGaps, includeUnlabeled).run();
}
