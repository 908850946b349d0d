#include "commands/PendingCommand.h"

namespace {

class CollapseCmd final : public PendingCommand<CollapseCmd> {
 public:
  static constexpr CommandInfo info = {.name = "collapse",
                                       .displayName = "Collapse Hierarchies",
                                       .category = "Data Editing",
                                       .purpose =
                                           "Copies the motion of one selected hierarchy onto a second one "
                                           "with the same names, in the active clip."};
};

}  // namespace

Command* newCollapseCmd() { return new (std::nothrow) CollapseCmd; }
