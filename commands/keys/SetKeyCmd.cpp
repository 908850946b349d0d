#include "commands/PendingCommand.h"

namespace {

class SetKeyCmd final : public PendingCommand<SetKeyCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "setKey",
      .displayName = "Set Key",
      .category = "Data Editing",
      .subCategory = "Data Manipulators",
      .purpose = "Writes a key on a channel, at the current time or at a frame.",
      .args = {"\"propertyType\" value1 ...", 2, 4, {Variable::String}},
      .options = {{"t", 1, Variable::Int},
                  {"r"},
                  {"all"},
                  {"onMod", 1, Variable::String, 16},
                  {"type", 1, Variable::String, 8}},
      .solo = Solo::no};
};

}  // namespace

Command* newSetKeyCmd() { return new (std::nothrow) SetKeyCmd; }
