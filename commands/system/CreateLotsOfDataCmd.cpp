#include <cmath>
#include <numbers>
#include <vector>

#include "host/command/ScriptCommand.h"
#include "host/scene/Database.h"
#include "host/scene/HTimeManager.h"
#include "host/scene/Marker.h"

namespace {

class CreateLotsOfDataCmd final : public ScriptCommand<CreateLotsOfDataCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "createLotsOfData",
      .displayName = "Create lots of data for test purposes",
      .category = "Testing",
      .purpose = "Fills the scene with markers that move, to test with.",
      .example = "createLotsOfData 10 100",
      .args = {"'numMarkers, NumFrames'", 2, 2, {Variable::Int, Variable::Int}},
      .argsText =
          "How many markers (0 or more) and frames (1 or more), at most 500 million positions in all. They "
          "are keyed in the active clip, else the first, else a new one; the animation and play ranges "
          "follow.",
      .solo = Solo::no};

  bool execute(Given const&, Args const& args, Variable&) override {
    int const markers = args[0].getIntValue(-1), frames = args[1].getIntValue(-1);
    if (markers < 0 || frames < 1 || int64{markers} * frames > kMostPositions) {
      logError(
          "createLotsOfData makes 0 or more markers, 1 or more frames and at most %lld positions, not %d by "
          "%d.",
          static_cast<long long>(kMostPositions), markers, frames);
      return false;
    }
    NLEClip* clip = clipForData();
    if (!clip) {
      g_db->logError("Unable to create a clip to contain the data.");
      return false;
    }
    HTimeManager& times = *HTimeManager::getInstance();
    for (int i = 0; i < markers; ++i) {
      HString name;
      name.Format("m_%i", i);
      auto* marker = static_cast<Marker*>(g_db->createModule(&Marker::staticClass(), name.GetStr(), nullptr));
      marker->getTranslationChannel()->setTrack(clip, 0, motion(i, frames, times.getTicksPerFrame()));
    }
    HTimeRange const range(0, (frames - 1) * times.getTicksPerFrame());
    times.setAnimRange(range, false);
    times.setPlayRange(range, false);
    return true;
  }

 private:
  static constexpr int64 kMostPositions = 500'000'000;  // 6 GB

  // The active clip, else the first that holds keys, else a new one.
  static NLEClip* clipForData() {
    if (NLEClip* active = g_db->getActiveClip(); active && active->holdsKeys()) return active;
    for (NLEClip* clip = g_db->getHeadClip(); clip; clip = clip->getNext())
      if (clip->holdsKeys()) return clip;
    return static_cast<Clip*>(g_db->createModule(&Clip::staticClass(), "", nullptr));
  }

  // A subject that walks in a circle of 2 m once in 10 s, with the marker at a place of its own on the body
  // and swinging twice a second. Rounded to 1/64 mm, which floats hold, as recorded positions are.
  static KeyTrack motion(int marker, int frames, int64 period) {
    double const turn =
        2 * std::numbers::pi * static_cast<double>(period) / kTicksPerSecond;  // a second's, by frame
    double const phase = marker * 0.7, height = 100 + marker % 17 * 100.0, reach = 50 + marker % 5 * 60.0;
    KeyTrack track(KeyTrack::Shape::Vector);
    std::vector<double> values(3 * kBlock);
    for (int first = 0; first < frames; first += kBlock) {
      int const count = std::min(kBlock, frames - first);
      for (int i = 0; i < count; ++i) {
        double const way = turn * (first + i), swing = std::sin(2 * way + phase);
        double const at[] = {2000 * std::cos(way / 10) + reach * std::cos(phase + way / 10) + 80 * swing,
                             2000 * std::sin(way / 10) + reach * std::sin(phase + way / 10),
                             height + 20 * std::cos(4 * way + phase)};
        for (int axis = 0; axis < 3; ++axis)
          values[static_cast<size_t>(3 * i + axis)] = std::round(at[axis] * 64) / 64;
      }
      track.append(first * period, period, values.data(), count);
    }
    return track;
  }
  static constexpr int kBlock = 4096;
};

}  // namespace

Command* newCreateLotsOfDataCmd() { return new (std::nothrow) CreateLotsOfDataCmd; }
