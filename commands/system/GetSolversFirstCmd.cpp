#include "commands/PendingCommand.h"

namespace {

class GetSolversFirstCmd final : public PendingCommand<GetSolversFirstCmd> {
 public:
  static constexpr CommandInfo info = {.name = "getSolversFirst",
                                       .displayName = "Get Solvers First Status",
                                       .category = "Skeletal Solving",
                                       .purpose = "Tells whether solvers are evaluated before clips.",
                                       .returns = Variable::Bool};
};

}  // namespace

Command* newGetSolversFirstCmd() { return new (std::nothrow) GetSolversFirstCmd; }
