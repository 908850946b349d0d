#include "commands/PendingCommand.h"

namespace {

class GetLabelingClusterOffsetCmd final : public PendingCommand<GetLabelingClusterOffsetCmd> {
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
};

}  // namespace

Command* newGetLabelingClusterOffsetCmd() { return new (std::nothrow) GetLabelingClusterOffsetCmd; }
