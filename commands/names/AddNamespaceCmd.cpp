#include "commands/PendingCommand.h"

namespace {

class AddNamespaceCmd final : public PendingCommand<AddNamespaceCmd> {
 public:
  static constexpr CommandInfo info = {.name = "addNamespace",
                                       .displayName = "Add Namespace",
                                       .category = "Namespace",
                                       .purpose = "Puts a namespace in front of the names of modules.",
                                       .args = {"namespace", 1, 1, {Variable::String}},
                                       .options = {{"onMod", 1, Variable::String}},
                                       .solo = Solo::no};
};

}  // namespace

Command* newAddNamespaceCmd() { return new (std::nothrow) AddNamespaceCmd; }
