#include "commands/hierarchy/Adjusting.h"

#include "host/scene/Database.h"
#include "host/time/HTimeManager.h"

void adjustNode(Node& node, Node* target, bool ranges) {
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

void warnOfNoData(Module const& module) {
  Command::logWarning("Object %s does not contain animation data. Skipping -adjust option",
                      module.getName().GetStr());
}
