#include "commands/PendingCommand.h"

namespace {

class SetRotationHardyCmd final : public PendingCommand<SetRotationHardyCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "setRotationHardy",
      .displayName = "Set Node Rotation",
      .category = "Data Editing",
      .subCategory = "Data Manipulators",
      .purpose = "Sets the two joint angles of the first selected labelling bone, in radians.",
      .args = {nullptr, 2, 2, {Variable::Float, Variable::Float}},
      .solo = Solo::no};
};

}  // namespace

Command* newSetRotationHardyCmd() { return new (std::nothrow) SetRotationHardyCmd; }
