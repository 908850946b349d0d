#include "commands/PendingCommand.h"

namespace {

class GetProfileStringCmd final : public PendingCommand<GetProfileStringCmd> {
 public:
  static constexpr CommandInfo info = {.name = "getProfileString",
                                       .displayName = "Get HString Value From Profile",
                                       .category = "System",
                                       .purpose = "Reads a text from a settings file.",
                                       .args = {"\"sectionHeader\" \"entry\" \"defaultValue\"",
                                                3,
                                                3,
                                                {Variable::String, Variable::String, Variable::String}},
                                       .options = {{"file", 1, Variable::String}},
                                       .returns = Variable::String,
                                       .solo = Solo::no};
};

}  // namespace

Command* newGetProfileStringCmd() { return new (std::nothrow) GetProfileStringCmd; }
