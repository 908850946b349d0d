#include "commands/PendingCommand.h"

namespace {

class GetStringPropertyCmd final : public PendingCommand<GetStringPropertyCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getStringProperty",
      .displayName = "Get HString Property",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose = "",
      .args = {"moduleName propertyName", 2, 2, {Variable::String, Variable::String}},
      .options = {{"fullPath"}},
      .returns = Variable::String,
      .solo = Solo::no};
};

}  // namespace

Command* newGetStringPropertyCmd() { return new (std::nothrow) GetStringPropertyCmd; }
