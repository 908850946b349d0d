#include "commands/PendingCommand.h"

namespace {

class GetDistanceCmd final : public PendingCommand<GetDistanceCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getDistance",
      .displayName = "GetDistance Command",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose = "Answers the distance of two nodes in millimetres, now or as a statistic over time.",
      .args = {"node1 node2", 0, ArgsInfo::kAny, {}, Variable::String},
      .options = {{"avg", 0, Variable::None, 1},
                  {"min", 0, Variable::None, 2},
                  {"max", 0, Variable::None, 4},
                  {"range", 0, Variable::None, 8},
                  {"sd", 0, Variable::None, 16},
                  {"rangesOnly", 0, Variable::None, 32},
                  {"mustHaveKeys", 0, Variable::None, 64}},
      .returns = Variable::Float,
      .solo = Solo::no};
};

}  // namespace

Command* newGetDistanceCmd() { return new (std::nothrow) GetDistanceCmd; }
