#include "commands/PendingCommand.h"

namespace {

class GetSelectedKeysCmd final : public PendingCommand<GetSelectedKeysCmd> {
 public:
  static constexpr CommandInfo info = {.name = "getSelectedKeys",
                                       .displayName = "Get Selected Key Times",
                                       .category = "Data Editing",
                                       .subCategory = "Data Retrieval",
                                       .purpose = "Lists the frames of the selected keys of a channel.",
                                       .args = {"propertyName", 1, 1, {Variable::String}},
                                       .options = {{"onMod", 1, Variable::String}},
                                       .returns = Variable::IntArray,
                                       .solo = Solo::no};
};

}  // namespace

Command* newGetSelectedKeysCmd() { return new (std::nothrow) GetSelectedKeysCmd; }
