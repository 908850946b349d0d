#include "commands/PendingCommand.h"

namespace {

class MakeUniqueCmd final : public PendingCommand<MakeUniqueCmd> {
 public:
  static constexpr CommandInfo info = {.name = "makeUnique",
                                       .displayName = "Make Module Paths Unique",
                                       .category = "Data Editing",
                                       .purpose = "Renames modules so that no two have the same full path."};
};

}  // namespace

Command* newMakeUniqueCmd() { return new (std::nothrow) MakeUniqueCmd; }
