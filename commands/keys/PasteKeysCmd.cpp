#include "commands/PendingCommand.h"

namespace {

class PasteKeysCmd final : public PendingCommand<PasteKeysCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "pasteKeys",
      .displayName = "Paste Keys",
      .category = "Data Editing",
      .purpose =
          "Writes the keys on the clipboard to the selected module, from the current time or a frame on.",
      .options = {{"useFrame", 1, Variable::Int}}};
};

}  // namespace

Command* newPasteKeysCmd() { return new (std::nothrow) PasteKeysCmd; }
