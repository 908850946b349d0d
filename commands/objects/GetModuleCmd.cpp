#include "commands/PendingCommand.h"

namespace {

class GetModuleCmd final : public PendingCommand<GetModuleCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getModule",
      .displayName = "Get Scene Module",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose = "",
      .options = {{"fullPath", 0, Variable::None, 2}, {"nameOnly", 0, Variable::None, 1}},
      .returns = Variable::String};
};

}  // namespace

Command* newGetModuleCmd() { return new (std::nothrow) GetModuleCmd; }
