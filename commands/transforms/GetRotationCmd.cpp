#include "commands/PendingCommand.h"

namespace {

class GetRotationCmd final : public PendingCommand<GetRotationCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getRotation",
      .displayName = "Get Node Rotation",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose = "Answers the rotation of a node as three angles in degrees.",
      .args = {"\"moduleName\"", 1, 1, {Variable::String}},
      .options = {{"ws", 0, Variable::None, 2},
                  {"inSpaceOf", 1, Variable::String, 1},
                  {"preRot", 0, Variable::None, 8},
                  {"def", 0, Variable::None, 4}},
      .returns = Variable::Vector,
      .solo = Solo::no};
};

}  // namespace

Command* newGetRotationCmd() { return new (std::nothrow) GetRotationCmd; }
