#include "commands/hierarchy/Adjusting.h"

#include "host/scene/Database.h"
#include "host/scene/HTimeManager.h"
#include "host/services/OperationStack.h"

namespace {

void keepMotion(Node& node, Node* target, bool ranges) {
  if (!ranges) {
    node.parentAdjust(target, HTimeRange::forever());
    return;
  }
  HTimeManager* time = HTimeManager::getInstance();
  for (int i = 0; i < time->getNumSelectedRanges(); ++i) {
    node.parentAdjust(target, time->getSelectedTimeRange(i));
    // With no active clip there are only default values, to be adjusted once.
    if (!g_db->getActiveClip()) return;
  }
}

}  // namespace

Node* nodeToAdjust(Module* module) {
  auto* node = objectAs<Node>(module);
  if (!node)
    Command::logWarning("Object %s does not contain animation data. Skipping -adjust option",
                        module->getName().GetStr());
  return node;
}

bool adjustNode(Adjusting const& adjusting, Node& node, Node* target) {
  keepMotion(node, target, adjusting.ranges);
  if (!adjusting.showProgress) return true;
  g_theOperationStack.stepTask();
  return !g_theOperationStack.isCancelled();
}
