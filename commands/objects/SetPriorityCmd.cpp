#include "commands/PendingCommand.h"

namespace {

class SetPriorityCmd final : public PendingCommand<SetPriorityCmd> {
 public:
  static constexpr CommandInfo info = {.name = "setPriority",
                                       .displayName = "Set Priority Node",
                                       .category = "Data Editing",
                                       .subCategory = "Data Manipulators",
                                       .purpose = ""};
};

}  // namespace

Command* newSetPriorityCmd() { return new (std::nothrow) SetPriorityCmd; }
