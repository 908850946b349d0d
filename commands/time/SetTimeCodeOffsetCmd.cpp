#include "commands/PendingCommand.h"

namespace {

class SetTimeCodeOffsetCmd final : public PendingCommand<SetTimeCodeOffsetCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "setTimeCodeOffset",
      .displayName = "Set Time Code Offset",
      .category = "Data Editing",
      .purpose = "Sets the timecode offset of the active clip, or of a named one, in frames.",
      .args = {"offset", 1, 1, {Variable::Int}},
      .options = {{"onClip", 1, Variable::String}}};
};

}  // namespace

Command* newSetTimeCodeOffsetCmd() { return new (std::nothrow) SetTimeCodeOffsetCmd; }
