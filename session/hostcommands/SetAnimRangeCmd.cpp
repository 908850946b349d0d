#include "host/command/Arguments.h"
#include "host/command/Frames.h"
#include "host/scene/HTimeManager.h"

namespace talix {

namespace {

class SetAnimRangeCmd final : public ScriptCommand<SetAnimRangeCmd> {
 public:
  static constexpr CommandInfo info = {.name = "setAnimRange",
                                       .displayName = "Set Animation Range",
                                       .category = "Interface",
                                       .purpose = "Sets the range of frames that the scene has.",
                                       .example = "setAnimRange 0 10",
                                       .args = {"START END", 2, 2},
                                       .argsText =
                                           "First and last frame, both included; fractions will do. From "
                                           "then on takes are saved over this range."};

  bool checkArgSyntax(Args const& args, Given const&) const override {
    return args.getCount() == 2 && areIntsOrFloats(args);
  }

  bool execute(Given const&, Args const& args, Variable&) override {
    auto const range = rangeOfFrames(args[0].getFloatValue(-1), args[1].getFloatValue(-1));
    if (range) HTimeManager::getInstance()->setAnimRange(*range, true);
    return range.has_value();
  }
};

}  // namespace

Command* newSetAnimRangeCmd() { return new SetAnimRangeCmd; }

}  // namespace talix
