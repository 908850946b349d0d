#include "commands/PendingCommand.h"

namespace {

class GetPriorityCmd final : public PendingCommand<GetPriorityCmd> {
 public:
  static constexpr CommandInfo info = {.name = "getPriority",
                                       .displayName = "Get Priority Selection",
                                       .category = "Data Editing",
                                       .subCategory = "Data Manipulators",
                                       .purpose = "",
                                       .returns = Variable::String};
};

}  // namespace

Command* newGetPriorityCmd() { return new (std::nothrow) GetPriorityCmd; }
