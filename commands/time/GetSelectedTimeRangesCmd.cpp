#include "commands/PendingCommand.h"

namespace {

class GetSelectedTimeRangesCmd final : public PendingCommand<GetSelectedTimeRangesCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getSelectedTimeRanges",
      .displayName = "Get Selected Time Ranges",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose = "Lists the first and last frames of the time ranges selected in the time bar.",
      .options = {{"noFeedback"}},
      .returns = Variable::IntArray};
};

}  // namespace

Command* newGetSelectedTimeRangesCmd() { return new (std::nothrow) GetSelectedTimeRangesCmd; }
