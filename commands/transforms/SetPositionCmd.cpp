#include "commands/PendingCommand.h"

namespace {

class SetPositionCmd final : public PendingCommand<SetPositionCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "setPosition",
      .displayName = "Set Node Position",
      .category = "Data Editing",
      .subCategory = "Data Manipulators",
      .purpose = "Moves a node to a position in millimetres, local or in the world.",
      .args = {"\"moduleName\" posVec", 2, 2, {Variable::String, Variable::Vector}},
      .options = {{"ws"}, {"preTrans", 0, Variable::None, 4}, {"default", 0, Variable::None, 2}},
      .solo = Solo::no};
};

}  // namespace

Command* newSetPositionCmd() { return new (std::nothrow) SetPositionCmd; }
