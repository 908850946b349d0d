#include <algorithm>

#include "host/command/Results.h"
#include "host/command/ScriptCommand.h"
#include "host/scene/HTimeManager.h"

namespace {

class GetSelectedTimeRangesCmd final : public ScriptCommand<GetSelectedTimeRangesCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getSelectedTimeRanges",
      .displayName = "Get Selected Time Ranges",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose = "Lists the first and last frames of the time ranges selected in the time bar.",
      .example = "getSelectedTimeRanges -noFeedback",
      .argsText =
          "Whole frames inside the ranges, first and last in turn. Without a range a warning and no result.",
      .options = {{"noFeedback", "no warning when no range is selected"}},
      .returns = Variable::IntArray};

  static constexpr int kNoFeedback = info.option("noFeedback");

  bool execute(Given const& given, Args const&, Variable& result) override {
    HTimeManager const& times = *HTimeManager::getInstance();
    int const count = times.getNumSelectedRanges();
    if (count < 1) {
      if (!GivenOptions(given).has(kNoFeedback)) logWarning("No time ranges selected");
      return true;
    }
    int64 const frame = times.getTicksPerFrame();
    Variable frames(Variable::IntArray, 2 * count);
    for (int i = 0; i < count; ++i) {
      HTimeRange const range = times.getSelectedTimeRange(i);
      int64 const start = range.getStart() + (range.getStart() % frame != 0 ? frame : 0);
      int64 const end = std::max(start, range.getEnd() / frame * frame);
      frames.setValue(times.getFrame(start), 2 * i);
      frames.setValue(times.getFrame(end), 2 * i + 1);
    }
    return answer(result, frames);
  }
};

}  // namespace

Command* newGetSelectedTimeRangesCmd() { return new (std::nothrow) GetSelectedTimeRangesCmd; }
