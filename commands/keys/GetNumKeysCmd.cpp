#include "commands/PendingCommand.h"

namespace {

class GetNumKeysCmd final : public PendingCommand<GetNumKeysCmd> {
 public:
  static constexpr CommandInfo info = {.name = "getNumKeys",
                                       .displayName = "Get Number of Keys",
                                       .category = "Data Editing",
                                       .subCategory = "Data Retrieval",
                                       .purpose = "Counts the keys of a channel, or only the selected ones.",
                                       .args = {"propertyName", 1, 1, {Variable::String}},
                                       .options = {{"s"}, {"onMod", 1, Variable::String}},
                                       .returns = Variable::Int,
                                       .solo = Solo::no};
};

}  // namespace

Command* newGetNumKeysCmd() { return new (std::nothrow) GetNumKeysCmd; }
