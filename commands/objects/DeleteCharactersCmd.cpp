#include "commands/PendingCommand.h"

namespace {

class DeleteCharactersCmd final : public PendingCommand<DeleteCharactersCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "deleteCharacters",
      .displayName = "Delete Characters",
      .category = "Data Editing",
      .purpose = "Deletes the selected characters, or all, with their setups.",
      .options = {{"all"}, {"keepLabels"}}};
};

}  // namespace

Command* newDeleteCharactersCmd() { return new (std::nothrow) DeleteCharactersCmd; }
