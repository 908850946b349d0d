#include "commands/PendingCommand.h"

namespace {

class GetRotationHingeCmd final : public PendingCommand<GetRotationHingeCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getRotationHinge",
      .displayName = "Get Node Rotation",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose = "Logs the hinge angle of the first selected labelling bone.",
      .solo = Solo::no};
};

}  // namespace

Command* newGetRotationHingeCmd() { return new (std::nothrow) GetRotationHingeCmd; }
