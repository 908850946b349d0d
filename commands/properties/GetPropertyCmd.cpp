#include "commands/PendingCommand.h"

namespace {

class GetPropertyCmd final : public PendingCommand<GetPropertyCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getProperty",
      .displayName = "Get Property",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose = "",
      .args = {"moduleName propertyName", 2, 2, {Variable::String, Variable::String}},
      .options = {{"c"}, {"d"}},
      .returns = Variable::Float,
      .solo = Solo::no};
};

}  // namespace

Command* newGetPropertyCmd() { return new (std::nothrow) GetPropertyCmd; }
