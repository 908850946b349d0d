#include "commands/PendingCommand.h"

namespace {

class GetModulesCmd final : public PendingCommand<GetModulesCmd> {
 public:
  static constexpr CommandInfo info = {.name = "getModules",
                                       .displayName = "Get Scene Modules",
                                       .category = "Data Editing",
                                       .subCategory = "Data Retrieval",
                                       .purpose = "",
                                       .options = {{"type", 1, Variable::String},
                                                   {"primary", 0, Variable::None, 4},
                                                   {"selected", 0, Variable::None, 2},
                                                   {"fullPath", 0, Variable::None, 16},
                                                   {"nameOnly", 0, Variable::None, 8}},
                                       .returns = Variable::StringArray};
};

}  // namespace

Command* newGetModulesCmd() { return new (std::nothrow) GetModulesCmd; }
