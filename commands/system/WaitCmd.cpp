#include "commands/PendingCommand.h"

namespace {

class WaitCmd final : public PendingCommand<WaitCmd> {
 public:
  static constexpr CommandInfo info = {.name = "wait",
                                       .displayName = "Wait",
                                       .category = "Interface",
                                       .purpose = "Pauses for so many milliseconds.",
                                       .args = {"milliseconds", 1, 1, {Variable::Int}}};
};

}  // namespace

Command* newWaitCmd() { return new (std::nothrow) WaitCmd; }
