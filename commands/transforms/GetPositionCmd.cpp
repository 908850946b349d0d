#include "commands/PendingCommand.h"

namespace {

class GetPositionCmd final : public PendingCommand<GetPositionCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getPosition",
      .displayName = "Get Node Position",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose =
          "Answers the position of a node in millimetres: local, in the world, or as seen from another node.",
      .args = {"\"moduleName\"", 1, 1, {Variable::String}},
      .options = {{"ws", 0, Variable::None, 2},
                  {"inSpaceOf", 1, Variable::String, 1},
                  {"preTrans", 0, Variable::None, 8},
                  {"default", 0, Variable::None, 4}},
      .returns = Variable::Vector,
      .solo = Solo::no};
};

}  // namespace

Command* newGetPositionCmd() { return new (std::nothrow) GetPositionCmd; }
