#include "commands/PendingCommand.h"

namespace {

class GetIntArrayPropertyCmd final : public PendingCommand<GetIntArrayPropertyCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getIntArrayProperty",
      .displayName = "Get Array of Integer Properties",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose = "",
      .args = {"moduleName propertyName", 2, 2, {Variable::String, Variable::String}},
      .returns = Variable::IntArray,
      .solo = Solo::no};
};

}  // namespace

Command* newGetIntArrayPropertyCmd() { return new (std::nothrow) GetIntArrayPropertyCmd; }
