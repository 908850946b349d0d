#include "commands/PendingCommand.h"

namespace {

class GetFloatPropertyCmd final : public PendingCommand<GetFloatPropertyCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getFloatProperty",
      .displayName = "Get Float Property",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose = "",
      .args = {"moduleName propertyName", 2, 2, {Variable::String, Variable::String}},
      .options = {{"c"}, {"d"}},
      .returns = Variable::Float,
      .solo = Solo::no};
};

}  // namespace

Command* newGetFloatPropertyCmd() { return new (std::nothrow) GetFloatPropertyCmd; }
