#include "host/command/Results.h"
#include "host/command/ScriptCommand.h"
#include "host/command/Targets.h"

namespace {

class IsSelectedCmd final : public ScriptCommand<IsSelectedCmd> {
 public:
  static constexpr CommandInfo info = {.name = "isSelected",
                                       .displayName = "Is Selected",
                                       .category = "Data Editing",
                                       .subCategory = "Data Retrieval",
                                       .purpose = "Tells whether a module is selected.",
                                       .example = "isSelected LFHD",
                                       .args = {"module", 1, 1, {Variable::String}},
                                       .argsText = "module is a path.",
                                       .returns = Variable::Bool,
                                       .solo = Solo::no};

  bool execute(Given const&, Args const& args, Variable& result) override;
};

bool IsSelectedCmd::execute(Given const&, Args const& args, Variable& result) {
  Module const* module = moduleAt(args[0].getStringValue(-1));
  return module && answer(result, module->isSelected());
}

}  // namespace

Command* newIsSelectedCmd() { return new (std::nothrow) IsSelectedCmd; }
