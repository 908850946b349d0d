#include "commands/PendingCommand.h"

namespace {

class UnpackCmd final : public PendingCommand<UnpackCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "unpack",
      .displayName = "Unpack Marker Data",
      .category = "Data Editing",
      .purpose = "Splits markers at their gaps into one marker for each piece."};
};

}  // namespace

Command* newUnpackCmd() { return new (std::nothrow) UnpackCmd; }
