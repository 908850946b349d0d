#include "commands/PendingCommand.h"

namespace {

class GetNamespaceCmd final : public PendingCommand<GetNamespaceCmd> {
 public:
  static constexpr CommandInfo info = {.name = "getNamespace",
                                       .displayName = "Get Namespace",
                                       .category = "Namespace",
                                       .purpose = "Answers the whole namespace of a module.",
                                       .options = {{"onMod", 1, Variable::String}},
                                       .returns = Variable::String,
                                       .solo = Solo::no};
};

}  // namespace

Command* newGetNamespaceCmd() { return new (std::nothrow) GetNamespaceCmd; }
