#include "commands/PendingCommand.h"

namespace {

class GetNumModulesCmd final : public PendingCommand<GetNumModulesCmd> {
 public:
  static constexpr CommandInfo info = {.name = "getNumModules",
                                       .displayName = "Get Number of Modules",
                                       .category = "Data Editing",
                                       .subCategory = "Data Retrieval",
                                       .purpose = "",
                                       .options = {{"type", 1, Variable::String}, {"selected"}},
                                       .returns = Variable::Int};
};

}  // namespace

Command* newGetNumModulesCmd() { return new (std::nothrow) GetNumModulesCmd; }
