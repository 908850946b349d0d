#include "commands/PendingCommand.h"

namespace {

class GetKeysCmd final : public PendingCommand<GetKeysCmd> {
 public:
  static constexpr CommandInfo info = {.name = "getKeys",
                                       .displayName = "Get Key Times",
                                       .category = "Data Editing",
                                       .subCategory = "Data Retrieval",
                                       .purpose = "Lists the frames at which a channel has keys.",
                                       .args = {"propertyName", 1, 1, {Variable::String}},
                                       .options = {{"onMod", 1, Variable::String}},
                                       .returns = Variable::IntArray,
                                       .solo = Solo::no};
};

}  // namespace

Command* newGetKeysCmd() { return new (std::nothrow) GetKeysCmd; }
