#include "commands/PendingCommand.h"

namespace {

class SetSolvingFirstCmd final : public PendingCommand<SetSolvingFirstCmd> {
 public:
  static constexpr CommandInfo info = {.name = "setSolversFirst",
                                       .displayName = "Set Solvers First Status",
                                       .category = "Interface",
                                       .purpose = "Has solvers evaluated before clips, or after them.",
                                       .args = {"boolean", 1, 1, {Variable::Bool}}};
};

}  // namespace

Command* newSetSolvingFirstCmd() { return new (std::nothrow) SetSolvingFirstCmd; }
