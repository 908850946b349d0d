#include "host/command/Arguments.h"
#include "host/command/Frames.h"
#include "host/scene/HTimeManager.h"

namespace talix {

namespace {

class SetPlayRangeCmd final : public ScriptCommand<SetPlayRangeCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "setPlayRange",
      .displayName = "Set Play Range",
      .category = "Interface",
      .purpose = "Sets the range of frames that is played; the current time stays.",
      .example = "setPlayRange 0 10",
      .args = {"START END", 2, 2},
      .argsText = "First and last frame, both included; fractions will do."};

  bool checkArgSyntax(Args const& args, Given const&) const override {
    return args.getCount() == 2 && areIntsOrFloats(args);
  }

  bool execute(Given const&, Args const& args, Variable&) override {
    auto const range = rangeOfFrames(args[0].getFloatValue(-1), args[1].getFloatValue(-1));
    if (range) HTimeManager::getInstance()->setPlayRange(*range, true);
    return range.has_value();
  }
};

}  // namespace

Command* newSetPlayRangeCmd() { return new SetPlayRangeCmd; }

}  // namespace talix
