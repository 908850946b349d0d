#include "host/command/Arguments.h"
#include "host/command/Frames.h"
#include "host/scene/HTimeManager.h"

namespace talix {

namespace {

class SelectTimeCmd final : public ScriptCommand<SelectTimeCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "selectTime",
      .displayName = "Select Time",
      .category = "Data Editing",
      .subCategory = "Data Manipulators",
      .purpose = "Selects a range of frames, or adds one to those selected.",
      .example = "selectTime 10 20 -add",
      .args = {"[START END]", 0, 2},
      .argsText =
          "First and last frame, both included; fractions will do. Replaces the ranges that were selected.",
      .options = {{"add", "keeps the ranges that were selected", 0, Variable::None, 0b10},
                  {"none", "selects no range; with START and END this one alone", 0, Variable::None, 0b01}}};
  static constexpr int kAdd = info.option("add"), kNone = info.option("none");

  bool checkArgSyntax(Args const& args, Given const& options) const override {
    if (args.getCount() == 0) return GivenOptions(options).has(kNone);
    return args.getCount() == 2 && areIntsOrFloats(args);
  }

  bool execute(Given const& given, Args const& args, Variable&) override {
    GivenOptions const options(given);
    HTimeRange range;
    if (args.getCount() > 0) {
      auto const chosen = rangeOfFrames(args[0].getFloatValue(-1), args[1].getFloatValue(-1));
      if (!chosen) return false;
      range = *chosen;
    }
    HTimeManager& times = *HTimeManager::getInstance();
    if (!options.has(kAdd) || options.has(kNone)) times.clearSelectedTimeRanges();
    times.addSelectedTimeRange(range);
    return true;
  }
};

}  // namespace

Command* newSelectTimeCmd() { return new SelectTimeCmd; }

}  // namespace talix
