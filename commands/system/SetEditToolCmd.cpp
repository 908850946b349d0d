#include "host/command/Results.h"
#include "host/command/ScriptCommand.h"
#include "host/services/Manipulator.h"

namespace {

class SetEditToolCmd final : public ScriptCommand<SetEditToolCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "setEditTool",
      .displayName = "Set Editing Tool",
      .category = "Interface",
      .purpose = "Switches to an editing tool by number, 0 to 5, and returns the one before.",
      .example = "setEditTool 2",
      .args = {"toolId", 1, 1, {Variable::Int}},
      .argsText = "0 select, 1 translate, 2 rotate, 3 scale, 4 orbit, 5 pan.",
      .returns = Variable::Int,
      .solo = Solo::no};

  bool execute(Given const&, Args const& args, Variable& result) override {
    int const tool = args[0].getIntValue(-1);
    if (tool < Manipulator::Select || tool > Manipulator::Pan) {
      logError("%d is not a valid Edit Tool number", tool);
      return false;
    }
    auto const former = static_cast<int>(Manipulator::getCurrentToolType());
    Manipulator::setCurrentToolType(static_cast<Manipulator::EToolType>(tool));
    return answer(result, former);
  }
};

}  // namespace

Command* newSetEditToolCmd() { return new (std::nothrow) SetEditToolCmd; }
