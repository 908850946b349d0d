#include "commands/PendingCommand.h"

namespace {

class GetIntPropertyCmd final : public PendingCommand<GetIntPropertyCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getIntProperty",
      .displayName = "Get Integer Property",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose = "",
      .args = {"moduleName propertyName", 2, 2, {Variable::String, Variable::String}},
      .options = {{"c"}, {"d"}},
      .returns = Variable::Int,
      .solo = Solo::no};
};

}  // namespace

Command* newGetIntPropertyCmd() { return new (std::nothrow) GetIntPropertyCmd; }
