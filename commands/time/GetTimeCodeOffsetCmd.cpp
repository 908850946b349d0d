#include "commands/PendingCommand.h"

namespace {

class GetTimeCodeOffsetCmd final : public PendingCommand<GetTimeCodeOffsetCmd> {
 public:
  static constexpr CommandInfo info = {.name = "getTimeCodeOffset",
                                       .displayName = "Get Time Code Offset",
                                       .category = "Data Editing",
                                       .purpose = "The timecode offset of the active clip in frames.",
                                       .returns = Variable::Int};
};

}  // namespace

Command* newGetTimeCodeOffsetCmd() { return new (std::nothrow) GetTimeCodeOffsetCmd; }
