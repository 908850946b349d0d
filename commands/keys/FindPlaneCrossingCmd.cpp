#include <algorithm>
#include <vector>

#include "host/command/Arguments.h"
#include "host/command/ScriptCommand.h"
#include "host/scene/Database.h"
#include "host/scene/HTimeManager.h"
#include "host/scene/SceneReader.h"

namespace {

class FindPlaneCrossingCmd final : public ScriptCommand<FindPlaneCrossingCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "findPlaneCrossing",
      .displayName = "Find Plane Crossings",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose =
          "Selects the keys at which the selected nodes pass behind a "
          "plane, given by a point and a direction.",
      .example = "findPlaneCrossing 0 0 5 0 0 1",
      .args = {"xPoint yPoint zPoint xDirection yDirection zDirection"},
      .argsText =
          "A point of the plane in mm and the direction it faces, in the world; behind is opposite to that. "
          "Looks at the selected nodes at each frame of the play range and selects keys of their Translation "
          "only. Former selected keys there are deselected; who stays behind to the end of the range is left "
          "out."};

  // Numbers of any kind will do.
  bool checkArgSyntax(Args const& args, Given const&) const override {
    return args.getCount() == 6 && areNumbers(args);
  }

  bool execute(Given const&, Args const& args, Variable&) override;
};

struct Plane {
  Vec3 point, normal;

  // The point itself has no direction from the plane: the product is not a number and counts as behind.
  bool isBehind(Vec3 const& position) const {
    Vec3 toward = position - point;
    toward.normalize();
    return !(toward.dot(normal) >= 0);
  }
};

Vec3 vectorAt(Args const& args, int i) {
  return {args[i].getFloatValue(-1), args[i + 1].getFloatValue(-1), args[i + 2].getFloatValue(-1)};
}

// Selects the keys of the selected nodes' frames behind the plane, run by run, and returns their number.
// Before the first and after the last key of all that moves them nothing changes: there one frame on each
// side tells about all.
int selectBehind(Plane const& plane) {
  HTimeManager const* time = HTimeManager::getInstance();
  std::vector<Node*> nodes;
  for (int i = 0; i < g_db->getNumSelectedNodes(); ++i) nodes.push_back(g_db->getSelectedNode(i));
  SceneReader const reader(std::vector<Node const*>(nodes.begin(), nodes.end()), g_db->getActiveClip());
  int64 const period = time->getTicksPerFrame();
  HTimeRange const play = time->getPlayRange(), motion = reader.getMotionRange();
  if (motion.isEmpty() || play.isEmpty()) return 0;
  int64 const most = (play.getEnd() - play.getStart()) / period;
  auto const frameOf = [&](int64 at) { return std::clamp<int64>((at - play.getStart()) / period, 0, most); };
  int64 const first = std::max<int64>(frameOf(motion.getStart()) - 1, 0);
  int64 const last = std::min(frameOf(motion.getEnd()) + 2, most);

  constexpr int64 kBlock = 256;
  std::vector<HTimeRange> behind(nodes.size());  // empty: in front
  std::vector<double> positions(3 * nodes.size() * kBlock);
  int selected = 0;
  for (int64 frame = first; frame <= last; frame += kBlock) {
    int64 const start = play.getStart() + frame * period, count = std::min(kBlock, last - frame + 1);
    SceneReader::Arrays arrays;
    arrays.positions = positions.data();
    reader.readWorld(SampleTimes(start, period, count), arrays);
    double const* position = positions.data();
    for (int64 t = start; t < start + count * period; t += period)
      for (size_t i = 0; i < nodes.size(); ++i, position += 3)
        if (plane.isBehind(Vec3(position))) {
          behind[i].include(t);
        } else if (!behind[i].isEmpty()) {
          selected += nodes[i]->getTransformChannel()->selectKeys(behind[i], KeyTrack::kAll);
          behind[i] = HTimeRange();
        }
  }
  return selected;  // kept: a run that lasts to the end of the play range is not selected
}

bool FindPlaneCrossingCmd::execute(Given const&, Args const& args, Variable&) {
  if (g_db->getNumSelectedNodes() == 0) {
    logWarning("No nodes selected for searching");
    return true;
  }
  Plane plane{vectorAt(args, 0), vectorAt(args, 3)};
  if (!(plane.normal.length() >= 1e-6)) {
    logError("Direction must not be zero");
    return false;
  }
  plane.normal.normalize();

  for (int i = 0; i < g_db->getNumSelectedNodes(); ++i)
    g_db->getSelectedNode(i)->getTransformChannel()->deselectKeys(HTimeRange::forever(), KeyTrack::kAll);
  int const selected = selectBehind(plane);
  selected > 0 ? logInfo("Found %d keys that penetrate the plane", selected)
               : logInfo("No plane penetration keys found");
  return true;
}

}  // namespace

Command* newFindPlaneCrossingCmd() { return new (std::nothrow) FindPlaneCrossingCmd; }
