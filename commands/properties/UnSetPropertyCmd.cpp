#include "commands/PendingCommand.h"

namespace {

class UnSetPropertyCmd final : public PendingCommand<UnSetPropertyCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "unsetProperty",
      .displayName = "Unset Property",
      .category = "Data Editing",
      .subCategory = "Data Manipulators",
      .purpose = "Returns an attribute of modules to its default value.",
      .args = {"propertyName", 1, 1, {Variable::String}},
      .options = {{"all"}, {"onMod", 1, Variable::String, 4}, {"type", 1, Variable::String, 2}},
      .solo = Solo::no};
};

}  // namespace

Command* newUnSetPropertyCmd() { return new (std::nothrow) UnSetPropertyCmd; }
