#include "host/command/Results.h"
#include "host/command/Targets.h"
#include "host/scene/Constraints.h"

namespace {

class GetLabelingClusterOffsetCmd final : public ScriptCommand<GetLabelingClusterOffsetCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getLabelingClusterOffsets",
      .displayName = "Get Labeling Cluster Offsets",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose = "Lists the offsets of the markers of a labelling cluster in millimetres.",
      .example = "getLabelingClusterOffsets Cluster",
      .args = {"'LabelingCluster name'", 1, 1, {Variable::String}},
      .argsText =
          "Path of a LabelingCluster. The offsets are its markers' default positions in its own space.",
      .returns = Variable::VectorArray,
      .solo = Solo::no};

  bool execute(Given const&, Args const& args, Variable& result) override;
};

bool GetLabelingClusterOffsetCmd::execute(Given const&, Args const& args, Variable& result) {
  auto const* cluster = moduleAt<LabelingCluster>(
      args[0].getStringValue(-1),
      // Kept: it speaks of constraints.
      "%s is not a valid path to a LabelingConstraint or SolvingConstraint in the scene");
  if (!cluster) return false;
  TSimpleArray<Vec3> const offsets = cluster->getMarkerOffsets();
  Variable list(Variable::VectorArray, offsets.getCount());
  for (int i = 0; i < offsets.getCount(); ++i) list.setValue(offsets[i], i);
  return answer(result, list);
}

}  // namespace

Command* newGetLabelingClusterOffsetCmd() { return new (std::nothrow) GetLabelingClusterOffsetCmd; }
