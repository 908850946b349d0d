#include "commands/PendingCommand.h"

namespace {

class SetRotationHingeCmd final : public PendingCommand<SetRotationHingeCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "setRotationHinge",
      .displayName = "Set Node Rotation",
      .category = "Data Editing",
      .subCategory = "Data Manipulators",
      .purpose = "Sets the hinge angle of the first selected labelling bone, in radians.",
      .args = {nullptr, 1, 1, {Variable::Float}},
      .solo = Solo::no};
};

}  // namespace

Command* newSetRotationHingeCmd() { return new (std::nothrow) SetRotationHingeCmd; }
