// Removing keys that a channel's curve does not need.
#include <algorithm>
#include <cmath>

#include "host/animation/Clips.h"
#include "host/animation/Controller.h"
#include "host/animation/KeyReduction.h"
#include "host/scene/Database.h"
#include "host/scene/Devices.h"
#include "host/scene/Marker.h"
#include "host/services/HInterface.h"
#include "host/time/HTimeManager.h"

namespace {

bool isLength(Controller const& channel) {
  const HString name = channel.getName();
  return name == "Translation" || name == "Length" || name == "Residual";
}

double toleranceFor(Controller const& channel, KeyTrack const& track, ReductionTolerances const& tolerances) {
  if (channel.getPropertyType() == DataSource::RotProperty) return tolerances.angle;
  return isLength(channel) ? tolerances.length : tolerances.ofRange * valueRange(track);
}

// The marker whose occlusion the keys of this layer tell: those of its positions, in the lowest layer that
// has any. Null for all other keys.
Marker* markerSeenBy(Controller const& channel, NLEClip const* clip, int layer) {
  auto* marker = objectAs<Marker>(channel.getModule());
  if (!marker || marker->getTranslationChannel() != &channel) return nullptr;
  while (layer-- > 0)
    if (KeyTrack const* lower = channel.findTrack(clip, layer); lower && !lower->empty()) return nullptr;
  return marker;
}

// Removed keys, between one that stayed and the next that did.
struct RemovedRun {
  int64 before, last, next;
};

std::vector<RemovedRun> removedRuns(KeyTrack const& original, KeyTrack const& reduced) {
  std::vector<RemovedRun> runs;
  KeyTrack::Reader rest(reduced, 0);
  int64 left = reduced.count(), before = 0, last = 0;
  int64 next = left > 0 ? rest.next().time : 0;
  bool open = false;
  original.forEach(0, original.count(), [&](KeyTrack::Key const& key) {
    if (left == 0 || key.time != next) {
      last = key.time;
      open = true;
      return;
    }
    if (open) runs.push_back({before, last, key.time});
    open = false;
    before = key.time;
    if (--left > 0) next = rest.next().time;
  });
  return runs;
}

// Keys the fill type "reduced" at the key before each run, instead of what is there up to its last key, so
// that its frames count as data. At the next key the fill type is as it was.
void markReduced(Marker& marker, NLEClip* clip, int activeLayer, KeyTrack const& original,
                 KeyTrack const& reduced) {
  const std::vector<RemovedRun> runs = removedRuns(original, reduced);
  if (runs.empty()) return;
  Controller* fillTypes = marker.addChannel("FillType", DataSource::IntProperty);
  const auto trackOf = [&](int layer) {
    KeyTrack const* track = fillTypes->findTrack(clip, layer);
    return track ? *track : KeyTrack(KeyTrack::Shape::Scalar);
  };
  std::vector<KeyTrack> layers;
  for (int layer = 0; layer < clip->getNumLayers(); ++layer) layers.push_back(trackOf(layer));

  KeyTrack& own = layers[static_cast<size_t>(activeLayer)];
  // The first mark shall not count for the frames before it.
  const int64 start = original.timeAt(0);
  if (own.empty() || own.timeAt(0) > runs.front().before) own.set(start, {Marker::Recorded});
  for (RemovedRun const& run : runs) {
    for (KeyTrack& track : layers) track.eraseRange(run.before, run.last);
    own.set(run.before, {Marker::Reduced});
    const bool known = std::any_of(layers.begin(), layers.end(),
                                   [&](KeyTrack const& track) { return track.find(run.next) >= 0; });
    if (!known) own.set(run.next, {Marker::Recorded});
  }

  fillTypes->beginDataEdit(HTimeRange(start, runs.back().next));
  for (int layer = 0; layer < clip->getNumLayers(); ++layer) {
    KeyTrack& track = layers[static_cast<size_t>(layer)];
    if (!track.sharesAll(trackOf(layer))) fillTypes->setTrack(clip, layer, std::move(track));
  }
  fillTypes->endDataEdit();
}

}  // namespace

ReductionTolerances ReductionTolerances::fromProfile() {
  return {.length = g_interface->getProfile(profile::kReductionLength),
          .angle = g_interface->getProfile(profile::kReductionAngle) * M_PI / 180,
          .ofRange = g_interface->getProfile(profile::kReductionPercent) / 100};
}

int Controller::reduceKeys(std::span<HTimeRange const> ranges, ReductionTolerances const& tolerances) {
  return reduce(
      [&](KeyTrack::Key const& key) {
        const auto range = std::partition_point(
            ranges.begin(), ranges.end(), [&](HTimeRange const& each) { return each.getEnd() < key.time; });
        return range != ranges.end() && range->contains(key.time);
      },
      tolerances);
}

int Controller::reduceSelectedKeys(ReductionTolerances const& tolerances) {
  return reduce([](KeyTrack::Key const& key) { return key.selected != 0; }, tolerances);
}

int Controller::reduce(std::function<bool(KeyTrack::Key const&)> mayGo,
                       ReductionTolerances const& tolerances) {
  NLEClip* clip = g_db->getActiveClip();
  const int layer = g_db->getActiveLayer();
  KeyTrack const* active = findActiveTrack();
  if (!active || !clip->holdsKeys()) return 0;

  const KeyTrack original = *active;
  Marker* marker = markerSeenBy(*this, clip, layer);
  ReductionRule rule{.interpolation = m_interpolation,
                     .tolerance = toleranceFor(*this, original, tolerances),
                     .framePeriod = HTimeManager::getInstance()->getTicksPerFrame(),
                     .isWhole = getPropertyType() == IntProperty,
                     .mayGo = std::move(mayGo),
                     .hasGaps = marker || objectAs<AnalogDevice>(m_module)};
  if (marker) rule.isBridged = [marker](int64 time) { return marker->getFillType(time) == Marker::Reduced; };
  KeyTrack reduced = original;
  const int64 removed = eraseComponents(reduced, redundantKeys(original, rule));
  if (removed == 0) return 0;
  if (marker) markReduced(*marker, clip, layer, original, reduced);
  setTrack(clip, layer, std::move(reduced));
  return static_cast<int>(removed);
}
