#include "commands/PendingCommand.h"

namespace {

class GetNamespacesCmd final : public PendingCommand<GetNamespacesCmd> {
 public:
  static constexpr CommandInfo info = {.name = "getNamespaces",
                                       .displayName = "Get Namespace",
                                       .category = "Namespace",
                                       .purpose = "Lists the namespaces of a module, the outermost first.",
                                       .options = {{"onMod", 1, Variable::String}},
                                       .returns = Variable::StringArray,
                                       .solo = Solo::no};
};

}  // namespace

Command* newGetNamespacesCmd() { return new (std::nothrow) GetNamespacesCmd; }
