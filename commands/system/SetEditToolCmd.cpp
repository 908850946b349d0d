#include "commands/PendingCommand.h"

namespace {

class SetEditToolCmd final : public PendingCommand<SetEditToolCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "setEditTool",
      .displayName = "Set Editing Tool",
      .category = "Interface",
      .purpose = "Switches to an editing tool by number, 0 to 5, and returns the one before.",
      .args = {"toolId", 1, 1, {Variable::Int}},
      .returns = Variable::Int,
      .solo = Solo::no};
};

}  // namespace

Command* newSetEditToolCmd() { return new (std::nothrow) SetEditToolCmd; }
