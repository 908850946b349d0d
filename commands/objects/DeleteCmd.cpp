#include "commands/PendingCommand.h"

namespace {

class DeleteCmd final : public PendingCommand<DeleteCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "delete",
      .displayName = "Delete",
      .category = "Data Editing",
      .purpose = "Deletes the selected modules, or all, with everything below them.",
      .options = {{"all", 0, Variable::None, 2}, {"primary", 0, Variable::None, 1}}};
};

}  // namespace

Command* newDeleteCmd() { return new (std::nothrow) DeleteCmd; }
