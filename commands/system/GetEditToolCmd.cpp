#include "commands/PendingCommand.h"

namespace {

class GetEditToolCmd final : public PendingCommand<GetEditToolCmd> {
 public:
  static constexpr CommandInfo info = {.name = "getEditTool",
                                       .displayName = "Get Current Edit Tool",
                                       .category = "Interface",
                                       .purpose = "The number of the current editing tool.",
                                       .returns = Variable::Int};
};

}  // namespace

Command* newGetEditToolCmd() { return new (std::nothrow) GetEditToolCmd; }
