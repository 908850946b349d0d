#include "commands/PendingCommand.h"

namespace {

class ReplaceNamespaceCmd final : public PendingCommand<ReplaceNamespaceCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "replaceNamespace",
      .displayName = "Replace Namespace",
      .category = "Namespace",
      .purpose = "Puts one namespace in the place of another in the names of modules.",
      .args = {"oldNamespace newNamespace", 2, 2, {Variable::String, Variable::String}},
      .options = {{"onMod", 1, Variable::String}},
      .solo = Solo::no};
};

}  // namespace

Command* newReplaceNamespaceCmd() { return new (std::nothrow) ReplaceNamespaceCmd; }
