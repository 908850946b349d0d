#include "commands/PendingCommand.h"

namespace {

class GetConstraintOffsetCmd final : public PendingCommand<GetConstraintOffsetCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getConstraintOffset",
      .displayName = "Get Constraint Offset",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose = "Answers the offset of a constraint in millimetres, in its own space or in the world.",
      .args = {"'constraintName'", 1, 1, {Variable::String}},
      .options = {{"ws"}},
      .returns = Variable::Vector,
      .solo = Solo::no};
};

}  // namespace

Command* newGetConstraintOffsetCmd() { return new (std::nothrow) GetConstraintOffsetCmd; }
