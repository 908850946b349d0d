#include "commands/PendingCommand.h"

namespace {

class RemoveNamespaceCmd final : public PendingCommand<RemoveNamespaceCmd> {
 public:
  static constexpr CommandInfo info = {.name = "removeNamespace",
                                       .displayName = "Remove Namespace",
                                       .category = "Namespace",
                                       .purpose = "Takes a namespace off the names of modules.",
                                       .args = {"namespace", 1, 1, {Variable::String}},
                                       .options = {{"onMod", 1, Variable::String}},
                                       .solo = Solo::no};
};

}  // namespace

Command* newRemoveNamespaceCmd() { return new (std::nothrow) RemoveNamespaceCmd; }
