#include "host/command/Results.h"
#include "host/command/ScriptCommand.h"
#include "host/scene/Database.h"

namespace {

class GetPriorityCmd final : public ScriptCommand<GetPriorityCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getPriority",
      .displayName = "Get Priority Selection",
      .category = "Data Editing",
      .subCategory = "Data Manipulators",
      .purpose = "The name of the priority module, below which short paths are looked for first.",
      .example = "getPriority",
      .argsText = "Empty when there is none.",
      .returns = Variable::String};

  bool execute(Given const&, Args const&, Variable& result) override;
};

bool GetPriorityCmd::execute(Given const&, Args const&, Variable& result) {
  Module const* module = g_db->getPriorityModule();
  return answer(result, module ? module->getName() : HString());
}

}  // namespace

Command* newGetPriorityCmd() { return new (std::nothrow) GetPriorityCmd; }
