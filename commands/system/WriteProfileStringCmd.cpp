#include "commands/PendingCommand.h"

namespace {

class WriteProfileStringCmd final : public PendingCommand<WriteProfileStringCmd> {
 public:
  static constexpr CommandInfo info = {.name = "writeProfileString",
                                       .displayName = "Write HString Value To Profile",
                                       .category = "System",
                                       .purpose = "Writes a text to a settings file.",
                                       .args = {"\"sectionHeader\" \"entry\" \"value\"",
                                                3,
                                                3,
                                                {Variable::String, Variable::String, Variable::String}},
                                       .options = {{"file", 1, Variable::String}},
                                       .returns = Variable::Bool,
                                       .solo = Solo::no};
};

}  // namespace

Command* newWriteProfileStringCmd() { return new (std::nothrow) WriteProfileStringCmd; }
