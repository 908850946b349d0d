#include "commands/PendingCommand.h"

namespace {

class GetParentCmd final : public PendingCommand<GetParentCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getParent",
      .displayName = "Get Parent",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose = "",
      .args = {"module", 1, 1, {Variable::String}},
      .options = {{"fullPath", 0, Variable::None, 2}, {"nameOnly", 0, Variable::None, 1}},
      .returns = Variable::String,
      .solo = Solo::no};
};

}  // namespace

Command* newGetParentCmd() { return new (std::nothrow) GetParentCmd; }
