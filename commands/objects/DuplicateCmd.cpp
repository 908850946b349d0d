#include "commands/PendingCommand.h"

namespace {

class DuplicateCmd final : public PendingCommand<DuplicateCmd> {
 public:
  static constexpr CommandInfo info = {.name = "duplicate",
                                       .displayName = "Duplicate Object",
                                       .category = "Data Editing",
                                       .purpose = "Makes a copy of every selected module.",
                                       .solo = Solo::yes};
};

}  // namespace

Command* newDuplicateCmd() { return new (std::nothrow) DuplicateCmd; }
