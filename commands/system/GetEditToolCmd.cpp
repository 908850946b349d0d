#include "host/command/Results.h"
#include "host/command/ScriptCommand.h"
#include "host/services/Manipulator.h"

namespace {

class GetEditToolCmd final : public ScriptCommand<GetEditToolCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getEditTool",
      .displayName = "Get Current Edit Tool",
      .category = "Interface",
      .purpose = "The number of the current editing tool.",
      .example = "getEditTool",
      .argsText = "0 select, 1 translate, 2 rotate, 3 scale, 4 orbit, 5 pan.",
      .returns = Variable::Int};

  bool execute(Given const&, Args const&, Variable& result) override {
    return answer(result, static_cast<int>(Manipulator::getCurrentToolType()));
  }
};

}  // namespace

Command* newGetEditToolCmd() { return new (std::nothrow) GetEditToolCmd; }
