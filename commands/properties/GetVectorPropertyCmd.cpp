#include "commands/PendingCommand.h"

namespace {

class GetVectorPropertyCmd final : public PendingCommand<GetVectorPropertyCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getVectorProperty",
      .displayName = "Get Vector/Rotation Property",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose = "",
      .args = {"moduleName propertyName", 2, 2, {Variable::String, Variable::String}},
      .options = {{"c"}, {"d"}},
      .returns = Variable::Vector,
      .solo = Solo::no};
};

}  // namespace

Command* newGetVectorPropertyCmd() { return new (std::nothrow) GetVectorPropertyCmd; }
