#include "commands/Results.h"
#include "host/command/ScriptCommand.h"
#include "host/scene/Constraints.h"
#include "host/scene/Database.h"

namespace {

class GetLabelingClusterOffsetCmd final : public ScriptCommand<GetLabelingClusterOffsetCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getLabelingClusterOffsets",
      .displayName = "Get Labeling Cluster Offsets",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose = "Lists the offsets of the markers of a labelling cluster in millimetres.",
      .args = {"'LabelingCluster name'", 1, 1, {Variable::String}},
      .returns = Variable::VectorArray,
      .solo = Solo::no};

  bool execute(Given const&, Args const& args, Variable& result) override;
};

bool GetLabelingClusterOffsetCmd::execute(Given const&, Args const& args, Variable& result) {
  HString const path = args[0].getStringValue(-1);
  auto const* cluster = objectAs<LabelingCluster>(
      g_db->getModuleWithPath(path, &LabelingCluster::s_classLabelingCluster, false));
  if (!cluster) {
    // Kept: it speaks of constraints.
    logError("%s is not a valid path to a LabelingConstraint or SolvingConstraint in the scene",
             path.GetStr());
    return false;
  }
  TSimpleArray<Vec3> const offsets = cluster->getMarkerOffsets();
  Variable list(Variable::VectorArray, offsets.getCount());
  for (int i = 0; i < offsets.getCount(); ++i) list.setValue(offsets[i], i);
  return answer(result, list);
}

}  // namespace

Command* newGetLabelingClusterOffsetCmd() { return new (std::nothrow) GetLabelingClusterOffsetCmd; }
