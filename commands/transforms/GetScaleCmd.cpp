#include "commands/PendingCommand.h"

namespace {

class GetScaleCmd final : public PendingCommand<GetScaleCmd> {
 public:
  static constexpr CommandInfo info = {.name = "getScale",
                                       .displayName = "Get Node Scale",
                                       .category = "Data Editing",
                                       .subCategory = "Data Retrieval",
                                       .purpose = "Answers the scale of a node along its three axes.",
                                       .args = {"\"moduleName\"", 1, 1, {Variable::String}},
                                       .options = {{"ws"}, {"inSpaceOf", 1, Variable::String, 1}, {"def"}},
                                       .returns = Variable::Vector,
                                       .solo = Solo::no};
};

}  // namespace

Command* newGetScaleCmd() { return new (std::nothrow) GetScaleCmd; }
