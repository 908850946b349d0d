#include "commands/PendingCommand.h"

namespace {

class GetModuleTypeCmd final : public PendingCommand<GetModuleTypeCmd> {
 public:
  static constexpr CommandInfo info = {.name = "getModuleType",
                                       .displayName = "Get Type of Module",
                                       .category = "Data Editing",
                                       .subCategory = "Data Retrieval",
                                       .purpose = "",
                                       .args = {"moduleName", 1, 1, {Variable::String}},
                                       .returns = Variable::String,
                                       .solo = Solo::no};
};

}  // namespace

Command* newGetModuleTypeCmd() { return new (std::nothrow) GetModuleTypeCmd; }
