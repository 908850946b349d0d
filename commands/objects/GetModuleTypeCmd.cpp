#include "host/command/Results.h"
#include "host/command/ScriptCommand.h"
#include "host/command/Targets.h"

namespace {

class GetModuleTypeCmd final : public ScriptCommand<GetModuleTypeCmd> {
 public:
  static constexpr CommandInfo info = {.name = "getModuleType",
                                       .displayName = "Get Type of Module",
                                       .category = "Data Editing",
                                       .subCategory = "Data Retrieval",
                                       .purpose = "The type of a module, such as Marker.",
                                       .example = "getModuleType LFHD",
                                       .args = {"moduleName", 1, 1, {Variable::String}},
                                       .argsText = "moduleName is a path.",
                                       .returns = Variable::String,
                                       .solo = Solo::no};

  bool execute(Given const&, Args const& args, Variable& result) override;
};

bool GetModuleTypeCmd::execute(Given const&, Args const& args, Variable& result) {
  Module const* module =
      moduleAt(args[0].getStringValue(-1),
               "%s  is not a valid unique path to a Module in the scene.");  // two spaces: kept
  return module && answer(result, module->getRuntimeClass()->getName());
}

}  // namespace

Command* newGetModuleTypeCmd() { return new (std::nothrow) GetModuleTypeCmd; }
