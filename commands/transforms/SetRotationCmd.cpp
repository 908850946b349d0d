#include "commands/PendingCommand.h"

namespace {

class SetRotationCmd final : public PendingCommand<SetRotationCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "setRotation",
      .displayName = "Set Node Rotation",
      .category = "Data Editing",
      .subCategory = "Data Manipulators",
      .purpose = "Turns a node to three angles in degrees, local or in the world.",
      .args = {"\"moduleName\" rotVec", 2, 2, {Variable::String, Variable::Vector}},
      .options = {{"ws"}, {"preRot", 0, Variable::None, 4}, {"def", 0, Variable::None, 2}},
      .solo = Solo::no};
};

}  // namespace

Command* newSetRotationCmd() { return new (std::nothrow) SetRotationCmd; }
