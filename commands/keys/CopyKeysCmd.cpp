#include "commands/PendingCommand.h"

namespace {

class CopyKeysCmd final : public PendingCommand<CopyKeysCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "copyKeys",
      .displayName = "Copy Keys",
      .category = "Data Editing",
      .purpose = "Puts keys of the active channels of one selected module on the key clipboard.",
      .options = {{"all", 0, Variable::None, 2}, {"ranges", 0, Variable::None, 1}},
      .returns = Variable::Int};
};

}  // namespace

Command* newCopyKeysCmd() { return new (std::nothrow) CopyKeysCmd; }
