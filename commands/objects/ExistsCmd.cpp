#include "commands/PendingCommand.h"

namespace {

class ExistsCmd final : public PendingCommand<ExistsCmd> {
 public:
  static constexpr CommandInfo info = {.name = "exists",
                                       .displayName = "Exists",
                                       .category = "Data Editing",
                                       .purpose = "",
                                       .args = {"modPath", 1, 1, {Variable::String}},
                                       .options = {{"type", 1, Variable::String}, {"priorityOnly"}},
                                       .returns = Variable::Bool,
                                       .solo = Solo::no};
};

}  // namespace

Command* newExistsCmd() { return new (std::nothrow) ExistsCmd; }
