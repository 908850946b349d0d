#include "host/command/Arguments.h"
#include "host/command/ChannelName.h"
#include "host/command/Targets.h"
namespace talix {

namespace {

class LockChannelCmd final : public ScriptCommand<LockChannelCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "lockChannel",
      .displayName = "Lock Channel",
      .category = "Data Editing",
      .subCategory = "Data Manipulators",
      .purpose = "Locks a channel of a module against editing, or unlocks it.",
      .example = "lockChannel LFHD Translation true",
      .args = {"PATH CHANNEL BOOLEAN", 3, 3, {Variable::String, Variable::String}},
      .argsText =
          "A module, one of its channels as a whole, and true, false or toggle. Commands that write pass a "
          "locked channel over, warn or fail; setProperty says which it writes all the same."};

  bool checkArgSyntax(Args const& args, Given const&) const override {
    if (!fits(info.args, args) || !args[2].isNumber()) return false;
    double const value = args[2].getFloatValue(-1);
    return value == 0 || value == 1 || value == 2;
  }

  bool execute(Given const&, Args const& args, Variable&) override {
    Module* module = moduleAt(args[0].getStringValue(-1));
    if (!module) return false;
    char const* name = args[1].getStringValue(-1);
    auto const choice = channelChoiceFrom(name);
    if (!choice) return false;
    if (choice->mask != 7) {
      logError("%s is a component; channels are locked as a whole.", name);
      return false;
    }
    Controller* channel = module->getProperty(choice->id);
    if (!channel) {
      logError("Cannot find property named %s on module %s", name, module->getName().GetStr());
      return false;
    }
    channel->setLocked(changed(channel->isLocked(), args[2].getBoolValue(-1)));
    return true;
  }
};

}  // namespace

Command* newLockChannelCmd() { return new LockChannelCmd; }

}  // namespace talix
