#include "host/command/Results.h"
#include "host/command/ScriptCommand.h"
#include "host/scene/Constraints.h"
#include "host/scene/Database.h"
#include "host/scene/HTimeManager.h"

namespace {

class GetConstraintOffsetCmd final : public ScriptCommand<GetConstraintOffsetCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getConstraintOffset",
      .displayName = "Get Constraint Offset",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose = "The offset of a constraint in millimetres, in its own space or in the world.",
      .example = "getConstraintOffset Pull -ws",
      .args = {"'constraintName'", 1, 1, {Variable::String}},
      .argsText = "Path of a SolvingConstraint or LabelingConstraint; where both have it, the solving one.",
      .options = {{"ws", "the place in the world at the current time instead of the offset from the bone"}},
      .returns = Variable::Vector,
      .solo = Solo::no};

  bool execute(Given const& given, Args const& args, Variable& result) override;
};

bool GetConstraintOffsetCmd::execute(Given const& given, Args const& args, Variable& result) {
  HString const path = args[0].getStringValue(-1);
  Module* module = g_db->getModuleWithPath(path, &SolvingConstraint::s_classSolvingConstraint, false);
  if (!module) module = g_db->getModuleWithPath(path, &LabelingConstraint::s_classLabelingConstraint, false);
  auto const* constraint = objectAs<PositionConstraintBase>(module);
  if (!constraint) {
    logError("%s is not a valid path to a LabelingConstraint or SolvingConstraint in the scene",
             path.GetStr());
    return false;
  }
  bool const world = GivenOptions(given).has(info.option("ws"));
  return answer(result, world ? constraint->getConstraintOffsetWS(HTimeManager::getInstance()->getTime())
                              : constraint->getConstraintOffset());
}

}  // namespace

Command* newGetConstraintOffsetCmd() { return new (std::nothrow) GetConstraintOffsetCmd; }
