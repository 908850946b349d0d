#include "commands/PendingCommand.h"

namespace {

class GetCountCmd final : public PendingCommand<GetCountCmd> {
 public:
  static constexpr CommandInfo info = {.name = "getCount",
                                       .displayName = "Get Array Size",
                                       .category = "Data Editing",
                                       .subCategory = "Data Retrieval",
                                       .purpose = "",
                                       .args = {"array", 1, 1},
                                       .returns = Variable::Int,
                                       .solo = Solo::no};
};

}  // namespace

Command* newGetCountCmd() { return new (std::nothrow) GetCountCmd; }
