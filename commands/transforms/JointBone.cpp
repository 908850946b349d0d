#include "commands/transforms/JointBone.h"

#include "host/command/Command.h"
#include "host/scene/Database.h"

LabelingBone* selectedLabelingBone() {
  LabelingBone* bone = g_db->getSelectedLabelingBone(0);
  if (!bone) Command::logError("No selected LabelingBone.");
  return bone;
}
