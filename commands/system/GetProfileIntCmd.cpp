#include "commands/PendingCommand.h"

namespace {

class GetProfileIntCmd final : public PendingCommand<GetProfileIntCmd> {
 public:
  static constexpr CommandInfo info = {.name = "getProfileInt",
                                       .displayName = "Get Int Value From Profile",
                                       .category = "System",
                                       .purpose = "Reads a whole number from a settings file.",
                                       .args = {"\"sectionHeader\" \"entry\" defaultValue",
                                                3,
                                                3,
                                                {Variable::String, Variable::String, Variable::Int}},
                                       .options = {{"file", 1, Variable::String}},
                                       .returns = Variable::Int,
                                       .solo = Solo::no};
};

}  // namespace

Command* newGetProfileIntCmd() { return new (std::nothrow) GetProfileIntCmd; }
