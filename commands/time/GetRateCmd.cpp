#include "commands/PendingCommand.h"

namespace {

class GetRateCmd final : public PendingCommand<GetRateCmd> {
 public:
  static constexpr CommandInfo info = {.name = "getRate",
                                       .displayName = "Get Scene Rate",
                                       .category = "Data Editing",
                                       .subCategory = "Data Retrieval",
                                       .purpose = "The frame rate of the scene in frames a second.",
                                       .returns = Variable::Float};
};

}  // namespace

Command* newGetRateCmd() { return new (std::nothrow) GetRateCmd; }
