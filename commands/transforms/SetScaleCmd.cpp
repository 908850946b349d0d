#include "commands/PendingCommand.h"

namespace {

class SetScaleCmd final : public PendingCommand<SetScaleCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "setScale",
      .displayName = "Set Node Scale",
      .category = "Data Editing",
      .subCategory = "Data Manipulators",
      .purpose = "Scales a node along its three axes, local or in the world.",
      .args = {"\"moduleName\" scaleVec", 2, 2, {Variable::String, Variable::Vector}},
      .options = {{"ws"}, {"def"}},
      .solo = Solo::no};
};

}  // namespace

Command* newSetScaleCmd() { return new (std::nothrow) SetScaleCmd; }
