#include "commands/PendingCommand.h"

namespace {

class ReduceKeysCmd final : public PendingCommand<ReduceKeysCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "reduceKeys",
      .displayName = "Reduce Keys",
      .category = "Data Editing",
      .purpose = "Removes keys that the curve does not need to keep its shape.",
      .options = {{"all", 0, Variable::None, 2}, {"ranges", 0, Variable::None, 1}}};
};

}  // namespace

Command* newReduceKeysCmd() { return new (std::nothrow) ReduceKeysCmd; }
