#include "commands/PendingCommand.h"

namespace {

class SetInterpTypeCmd final : public PendingCommand<SetInterpTypeCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "setInterpType",
      .displayName = "Set Interpolation Type",
      .category = "Data Editing",
      .subCategory = "Data Manipulators",
      .purpose =
          "Chooses how a channel runs from one key to the next: \"Constant\", \"Linear\" or \"Cubic\".",
      .args = {"propertyName interpType", 2, 2, {Variable::String, Variable::String}},
      .options = {{"onMod", 1, Variable::String}},
      .solo = Solo::no};
};

}  // namespace

Command* newSetInterpTypeCmd() { return new (std::nothrow) SetInterpTypeCmd; }
