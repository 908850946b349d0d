#include "commands/PendingCommand.h"

namespace {

class IsSelectedCmd final : public PendingCommand<IsSelectedCmd> {
 public:
  static constexpr CommandInfo info = {.name = "isSelected",
                                       .displayName = "Is Selected",
                                       .category = "Data Editing",
                                       .subCategory = "Data Retrieval",
                                       .purpose = "",
                                       .args = {"module", 1, 1, {Variable::String}},
                                       .returns = Variable::Bool,
                                       .solo = Solo::no};
};

}  // namespace

Command* newIsSelectedCmd() { return new (std::nothrow) IsSelectedCmd; }
