#include "host/command/Arguments.h"
#include "host/command/Frames.h"
#include "host/scene/HTimeManager.h"

namespace talix {

namespace {

class SetTimeCmd final : public ScriptCommand<SetTimeCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "setTime",
      .displayName = "Set Current Time",
      .category = "Interface",
      .purpose = "Moves the current time to a frame, which may be a fraction.",
      .example = "setTime 12.5",
      .args = {"FRAME", 1, 1},
      .argsText = "The time need not lie in a range."};

  bool checkArgSyntax(Args const& args, Given const&) const override {
    return args.getCount() == 1 && areIntsOrFloats(args);
  }

  bool execute(Given const&, Args const& args, Variable&) override {
    auto const time = timeOfFrame(args[0].getFloatValue(-1));
    if (time) HTimeManager::getInstance()->setTime(*time, true);
    return time.has_value();
  }
};

}  // namespace

Command* newSetTimeCmd() { return new SetTimeCmd; }

}  // namespace talix
