#include "commands/PendingCommand.h"

namespace {

class GetBooleanArrayPropertyCmd final : public PendingCommand<GetBooleanArrayPropertyCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getBooleanArrayProperty",
      .displayName = "Get Array of Boolean Properties",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose = "",
      .args = {"moduleName propertyName", 2, 2, {Variable::String, Variable::String}},
      .returns = Variable::BoolArray,
      .solo = Solo::no};
};

}  // namespace

Command* newGetBooleanArrayPropertyCmd() { return new (std::nothrow) GetBooleanArrayPropertyCmd; }
