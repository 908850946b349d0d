#include "commands/PendingCommand.h"

namespace {

class CreateKeyCmd final : public PendingCommand<CreateKeyCmd> {
 public:
  static constexpr CommandInfo info = {.name = "createKey",
                                       .displayName = "Create Key",
                                       .category = "Data Editing",
                                       .purpose =
                                           "Keys every active channel of the selected modules at the current "
                                           "time, with the values they have there."};
};

}  // namespace

Command* newCreateKeyCmd() { return new (std::nothrow) CreateKeyCmd; }
