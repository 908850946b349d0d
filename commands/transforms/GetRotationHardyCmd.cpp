#include "commands/PendingCommand.h"

namespace {

class GetRotationHardyCmd final : public PendingCommand<GetRotationHardyCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getRotationHardy",
      .displayName = "Get Node Rotation",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose = "Logs the two joint angles of the first selected labelling bone.",
      .solo = Solo::no};
};

}  // namespace

Command* newGetRotationHardyCmd() { return new (std::nothrow) GetRotationHardyCmd; }
