#include <vector>

#include "commands/Arguments.h"
#include "host/command/ScriptCommand.h"
#include "host/scene/Database.h"
#include "host/scene/HTimeManager.h"
#include "host/scene/Node.h"

namespace {

class FindPlaneCrossingCmd final : public ScriptCommand<FindPlaneCrossingCmd> {
 public:
  static constexpr CommandInfo info = {.name = "findPlaneCrossing",
                                       .displayName = "Find Plane Crossings",
                                       .category = "Data Editing",
                                       .subCategory = "Data Retrieval",
                                       .purpose =
                                           "Selects the keys at which the selected nodes pass behind a "
                                           "plane, given by a point and a direction.",
                                       .args = {"xPoint yPoint zPoint xDirection yDirection zDirection"}};

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

// Selects the keys of the selected nodes' frames behind the plane, run by run, and answers their number.
int selectBehind(Plane const& plane) {
  HTimeManager const* time = HTimeManager::getInstance();
  const HTimeRange play = time->getPlayRange();
  std::vector<HTimeRange> behind(static_cast<size_t>(g_db->getNumSelectedNodes()));  // empty: in front
  int selected = 0;
  // Frame by frame over all nodes, which share the placements of their ancestors.
  for (int64 t = play.getStart(); t <= play.getEnd(); t += time->getTicksPerFrame())
    for (size_t i = 0; i < behind.size(); ++i) {
      Node* node = g_db->getSelectedNode(static_cast<int>(i));
      if (plane.isBehind(node->getWSPos(t))) {
        behind[i].include(t);
      } else if (!behind[i].isEmpty()) {
        selected += node->getTransformChannel()->selectKeys(behind[i], KeyTrack::kAll);
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
  const int selected = selectBehind(plane);
  selected > 0 ? logInfo("Found %d keys that penetrate the plane", selected)
               : logInfo("No plane penetration keys found");
  return true;
}

}  // namespace

Command* newFindPlaneCrossingCmd() { return new (std::nothrow) FindPlaneCrossingCmd; }
