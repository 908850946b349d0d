#include "commands/hierarchy/Adjusting.h"
#include "host/command/Targets.h"
#include "host/scene/Bones.h"
#include "host/scene/Character.h"
#include "host/scene/Constraints.h"
#include "host/scene/Setups.h"
#include "host/scene/motion/MotionScope.h"
#include "host/services/OperationStack.h"

namespace {

class ParentCmd final : public ScriptCommand<ParentCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "parent",
      .displayName = "Parent Nodes",
      .category = "Data Editing",
      .subCategory = "Data Manipulators",
      .purpose = "Hangs the selected modules under the primary selected one.",
      .example = "parent -adjust",
      .argsText =
          "Needs two selected modules or more; the primary one becomes the parent of the others. Characters "
          "stay roots. Without -adjust local motion stays, so they move in the world.",
      .options = {
          {"adjust", "keeps their motion in the world: local keys of the active layer are computed anew", 0,
           Variable::None, 8},
          {"showProgress", "shows the progress and lets the user cancel; only with -adjust"},
          {"ranges", "adjusts in the selected time ranges only; only with -adjust or -adjustOnly"},
          {"adjustOnly", "computes the motion for the new parent, but leaves the modules where they are", 0,
           Variable::None, 1}}};

  bool execute(Given const& given, Args const&, Variable&) override;
};

bool isOneOf(Module const* module, HRuntimeClass const& a, HRuntimeClass const& b) {
  return module->isKindOf(&a) || module->isKindOf(&b);
}

// The selected nodes that will be adjusted.
int countNodesBelow(Module const* parent) {
  int count = 0;
  for (int i = 0; i < g_db->getNumSelectedNodes(); ++i) {
    Node const* node = g_db->getSelectedNode(i);
    count += node != parent && !node->isKindOf(&Character::s_classCharacter);
  }
  return count;
}

// Bones and constraints stay within setups of their own kind.
bool mayHang(Module const* module, Module const* parent) {
  if (isOneOf(module, LabelingBone::s_classLabelingBone, LabelingConstraint::s_classLabelingConstraint) &&
      parent->isKindOf(&SolvingSetup::s_classSolvingSetup)) {
    g_db->logError("LabelingBones and LabelingConstraints may not be parented to a SolvingSetup");
    return false;
  }
  if (isOneOf(module, SolvingBone::s_classSolvingBone, SolvingConstraint::s_classSolvingConstraint) &&
      parent->isKindOf(&LabelingSetup::s_classLabelingSetup)) {
    g_db->logError("SolvingBones and SolvingConstraints may not be parented to a LabelingSetup");
    return false;
  }
  return true;
}

// False when the user cancelled.
bool adjust(Adjusting const& adjusting, Module* module, Node* target) {
  Node* node = nodeToAdjust(module);
  if (!node) return true;
  if (adjusting.showProgress) {
    HString caption;
    caption.Format("Parent adjusting %s to %s", node->getName().GetStr(),
                   target ? target->getName().GetStr() : "the world");
    g_theOperationStack.setTaskCaption(caption);
    if (g_theOperationStack.isCancelled()) return false;
  }
  return adjustNode(adjusting, *node, target);
}

bool ParentCmd::execute(Given const& given, Args const&, Variable&) {
  int const count = g_db->getNumSelectedModules();
  if (count < 2) {
    logError("Must have at least 2 Modules selected");
    return false;
  }
  Module* parent = primaryModule("No primary selected Module.");
  if (!parent) return false;
  Adjusting const adjusting = Adjusting::from<ParentCmd>(given);
  Node* target = objectAs<Node>(parent) ? static_cast<Node*>(parent) : parent->getNodeParent();

  // kept: without adjusting no task is pushed, yet one is moved and popped at the end; and whoever returns
  // early leaves the task pushed.
  int steps = 0;
  if (adjusting.showProgress && adjusting.adjust) {
    steps = countNodesBelow(parent);
    g_theOperationStack.pushTask(0, steps, 0, 1, true, "");
  } else if (adjusting.showProgress) {
    logWarning("Can't use -showProgress flag without -adjust flag. Ignoring");
  }

  MotionScope const motion(*g_db);
  for (int i = 0; i < count; ++i) {
    Module* module = g_db->getSelectedModule(i);
    if (module == parent) continue;
    if (module->isKindOf(&Character::s_classCharacter)) {
      HString text;
      text.Format("Object %s is a Character. Characters must be root nodes. Skipping",
                  module->getName().GetStr());
      logWarning("%s", text.GetStr());
      continue;
    }
    if (adjusting.adjust && !adjust(adjusting, module, target)) return false;
    if (adjusting.move && !(mayHang(module, parent) && parent->addChild(module))) return false;
  }

  if (adjusting.showProgress) {
    g_theOperationStack.setTaskPos(steps);
    g_theOperationStack.popTask();
  }
  return true;
}

}  // namespace

Command* newParentCmd() { return new (std::nothrow) ParentCmd; }
