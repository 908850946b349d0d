#include "commands/PendingCommand.h"

namespace {

class GetChildrenCmd final : public PendingCommand<GetChildrenCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getChildren",
      .displayName = "Get Children",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose = "",
      .args = {"parentName", 1, 1, {Variable::String}},
      .options = {{"nodesOnly"}, {"fullPath", 0, Variable::None, 4}, {"nameOnly", 0, Variable::None, 2}},
      .returns = Variable::StringArray,
      .solo = Solo::no};
};

}  // namespace

Command* newGetChildrenCmd() { return new (std::nothrow) GetChildrenCmd; }
