#include "commands/PendingCommand.h"

namespace {

class SetPropertyCmd final : public PendingCommand<SetPropertyCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "setProperty",
      .displayName = "Set Property",
      .category = "Data Editing",
      .subCategory = "Data Manipulators",
      .purpose =
          "Sets a property of modules: an attribute, or the selected keys or the default of a channel.",
      .args = {"propertyName propertyVal1 propertyVal2 ...", 2, ArgsInfo::kAny, {Variable::String}},
      .options = {{"c", 0, Variable::None, 0, true},
                  {"r"},
                  {"all"},
                  {"onMod", 1, Variable::String, 16},
                  {"type", 1, Variable::String, 8},
                  {"d"}},
      .solo = Solo::no};
};

}  // namespace

Command* newSetPropertyCmd() { return new (std::nothrow) SetPropertyCmd; }
