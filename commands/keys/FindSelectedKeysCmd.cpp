#include "commands/PendingCommand.h"

namespace {

class FindSelectedKeysCmd final : public PendingCommand<FindSelectedKeysCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "findSelectedKeys",
      .displayName = "Find Next Selected Keys",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose = "Moves the current time to the next selected key of the selected nodes.",
      .options = {{"b"}}};
};

}  // namespace

Command* newFindSelectedKeysCmd() { return new (std::nothrow) FindSelectedKeysCmd; }
