#include <chrono>
#include <vector>

#include "host/command/ScriptCommand.h"
#include "host/scene/Database.h"
#include "host/scene/HTimeManager.h"
#include "host/scene/Marker.h"
#include "host/scene/SceneReader.h"
#include "host/services/OperationStack.h"

namespace {

class testSceneReadPerformanceCmd final : public ScriptCommand<testSceneReadPerformanceCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "testSceneReadPerformance",
      .displayName = "Tests Scene Read Performance",
      .category = "Testing",
      .purpose = "Measures how fast the scene can be read.",
      .example = "testSceneReadPerformance",
      .argsText =
          "Reads the world positions of every marker at the frames of the play range; logs frames a second."};

  // The world positions of all markers at all frames of the play range.
  bool execute(Given const&, Args const&, Variable&) override {
    TSimpleArray<Marker*> const markers = g_db->getMarkers();
    std::vector<Node const*> const nodes(markers.begin(), markers.end());
    HTimeManager const& times = *HTimeManager::getInstance();
    int64 const period = times.getTicksPerFrame();
    int64 const first = frameAtOrAfter(times.getPlayRange().getStart(), period);
    int64 const last = frameAtOrBefore(times.getPlayRange().getEnd(), period);
    int64 const frames = last < first ? 0 : last - first + 1;

    OperationTask const task("Reading the scene");
    auto const start = std::chrono::steady_clock::now();
    SceneReader const reader(nodes, g_db->getActiveClip());
    std::vector<double> positions(3 * nodes.size() * kBlock);
    int64 done = 0;
    while (done < frames && !g_theOperationStack.isCancelled()) {
      int64 const count = std::min(kBlock, frames - done);
      reader.readWorld(SampleTimes((first + done) * period, period, count), {.positions = positions.data()});
      done += count;
      task.tell(static_cast<double>(done), static_cast<double>(frames));
    }
    std::chrono::duration<double> const seconds = std::chrono::steady_clock::now() - start;
    logInfo("FPS: %f", done > 0 ? static_cast<double>(done) / seconds.count() : 0.0);
    return done == frames;
  }

 private:
  static constexpr int64 kBlock = 256;
};

}  // namespace

Command* newtestSceneReadPerformanceCmd() { return new (std::nothrow) testSceneReadPerformanceCmd; }
