#include "commands/hierarchy/Adjusting.h"
#include "host/scene/Database.h"
#include "host/scene/motion/MotionScope.h"
#include "host/services/OperationStack.h"

namespace {

class UnparentCmd final : public ScriptCommand<UnparentCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "unparent",
      .displayName = "Unparent Nodes",
      .category = "Data Editing",
      .subCategory = "Data Manipulators",
      .purpose = "Takes the selected modules out from under their parents.",
      .example = "unparent -adjust",
      .argsText =
          "All selected modules become roots. Without -adjust local motion stays, so they move in the world.",
      .options = {
          {"adjust", "keeps their motion in the world: local keys of the active layer are computed anew", 0,
           Variable::None, 8},
          {"showProgress", "shows the progress"},
          {"ranges", "adjusts in the selected time ranges only; only with -adjust or -adjustOnly"},
          {"adjustOnly", "computes the motion for the world, but leaves the modules where they are", 0,
           Variable::None, 1}}};

  bool execute(Given const& given, Args const&, Variable&) override;
};

// False when the user cancelled.
bool adjust(Adjusting const& adjusting, Module* module) {
  Node* node = nodeToAdjust(module);
  if (!node) return true;
  if (adjusting.showProgress) {
    HString caption;
    caption.Format("Unparent adjusting %s", node->getName().GetStr());
    g_theOperationStack.setTaskCaption(caption);
  }
  return adjustNode(adjusting, *node, nullptr);
}

bool UnparentCmd::execute(Given const& given, Args const&, Variable&) {
  int const count = g_db->getNumSelectedModules();
  if (count < 1) {
    logError("No modules selected");
    return false;
  }
  Adjusting const adjusting = Adjusting::from<UnparentCmd>(given);
  // kept: whoever returns early leaves the task pushed.
  if (adjusting.showProgress) g_theOperationStack.pushTask(0, g_db->getNumSelectedNodes(), 0, 1, true, "");

  MotionScope const motion(*g_db);
  for (int i = 0; i < count; ++i) {
    Module* module = g_db->getSelectedModule(i);
    Module* parent = module->getParent();
    if (!parent) continue;
    if (adjusting.adjust && !adjust(adjusting, module)) return false;
    if (adjusting.move) parent->removeChild(module, true);
  }

  if (adjusting.showProgress) g_theOperationStack.popTask();
  return true;
}

}  // namespace

Command* newUnparentCmd() { return new (std::nothrow) UnparentCmd; }
