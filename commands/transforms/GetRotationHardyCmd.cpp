#include "commands/transforms/JointBone.h"
#include "host/command/ScriptCommand.h"
#include "host/scene/Database.h"
#include "host/scene/HTimeManager.h"

namespace {

class GetRotationHardyCmd final : public ScriptCommand<GetRotationHardyCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getRotationHardy",
      .displayName = "Get Node Rotation",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose = "Logs the two joint angles of the first selected labelling bone.",
      .example = "getRotationHardy",
      .argsText = "About its major and minor axis at the current time, in radians.",
      .solo = Solo::no};

  bool execute(Given const&, Args const&, Variable&) override;
};

bool GetRotationHardyCmd::execute(Given const&, Args const&, Variable&) {
  LabelingBone const* bone = selectedLabelingBone();
  if (!bone) return false;
  double major = 0, minor = 0;
  bone->getLocalRot(HTimeManager::getInstance()->getTime())
      .getAsHardySpicerRotation(major, minor, bone->getMajorAxisIndex(), bone->getMinorAxisIndex());
  g_db->logInfo("Major angle: %f", major);
  g_db->logInfo("Minor angle: %f", minor);
  return true;
}

}  // namespace

Command* newGetRotationHardyCmd() { return new (std::nothrow) GetRotationHardyCmd; }
