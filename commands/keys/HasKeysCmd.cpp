#include "commands/PendingCommand.h"

namespace {

class HasKeysCmd final : public PendingCommand<HasKeysCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "hasKey",
      .displayName = "Has Key",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose = "Tells whether a channel has a key at the current time, at a frame, or anywhere.",
      .args = {"\"moduleName\" \"propertyName\"", 2, 2, {Variable::String, Variable::String}},
      .options = {{"selected", 0, Variable::None, 8},
                  {"seconds", 1, Variable::Int, 12},
                  {"frame", 1, Variable::Int, 10},
                  {"allTime", 0, Variable::None, 6},
                  {"any"}},
      .returns = Variable::Bool,
      .solo = Solo::no};
};

}  // namespace

Command* newHasKeysCmd() { return new (std::nothrow) HasKeysCmd; }
