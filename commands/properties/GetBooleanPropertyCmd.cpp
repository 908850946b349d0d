#include "commands/PendingCommand.h"

namespace {

class GetBooleanPropertyCmd final : public PendingCommand<GetBooleanPropertyCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getBooleanProperty",
      .displayName = "Get Boolean Property",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose = "",
      .args = {"moduleName propertyName", 2, 2, {Variable::String, Variable::String}},
      .options = {{"c"}, {"d"}},
      .returns = Variable::Bool,
      .solo = Solo::no};
};

}  // namespace

Command* newGetBooleanPropertyCmd() { return new (std::nothrow) GetBooleanPropertyCmd; }
