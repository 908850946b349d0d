#include "commands/PendingCommand.h"

namespace {

class SetRotationAngleAxisCmd final : public PendingCommand<SetRotationAngleAxisCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "setRotationAngleAxis",
      .displayName = "Set Node Rotation",
      .category = "Data Editing",
      .subCategory = "Data Manipulators",
      .purpose = "Turns a node by a vector along the axis, as long as the angle in radians.",
      .args = {"\"moduleName\" angleAxisRotation", 2, 2, {Variable::String, Variable::Vector}},
      .options = {{"ws"}, {"preRot", 0, Variable::None, 4}, {"def", 0, Variable::None, 2}},
      .solo = Solo::no};
};

}  // namespace

Command* newSetRotationAngleAxisCmd() { return new (std::nothrow) SetRotationAngleAxisCmd; }
