#include "commands/PendingCommand.h"

namespace {

class WriteProfileIntCmd final : public PendingCommand<WriteProfileIntCmd> {
 public:
  static constexpr CommandInfo info = {.name = "writeProfileInt",
                                       .displayName = "Write Int Value To Profile",
                                       .category = "System",
                                       .purpose = "Writes a whole number to a settings file.",
                                       .args = {"\"sectionHeader\" \"entry\" value",
                                                3,
                                                3,
                                                {Variable::String, Variable::String, Variable::Int}},
                                       .options = {{"file", 1, Variable::String}},
                                       .returns = Variable::Bool,
                                       .solo = Solo::no};
};

}  // namespace

Command* newWriteProfileIntCmd() { return new (std::nothrow) WriteProfileIntCmd; }
