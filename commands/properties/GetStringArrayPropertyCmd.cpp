#include "commands/PendingCommand.h"

namespace {

class GetStringArrayPropertyCmd final : public PendingCommand<GetStringArrayPropertyCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getStringArrayProperty",
      .displayName = "Get HString Array Property",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose = "",
      .args = {"moduleName propertyName", 2, 2, {Variable::String, Variable::String}},
      .returns = Variable::StringArray,
      .solo = Solo::no};
};

}  // namespace

Command* newGetStringArrayPropertyCmd() { return new (std::nothrow) GetStringArrayPropertyCmd; }
