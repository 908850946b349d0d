#include "commands/transforms/JointBone.h"
#include "host/command/ScriptCommand.h"
#include "host/scene/Database.h"
#include "host/scene/HTimeManager.h"

namespace {

class GetRotationHingeCmd final : public ScriptCommand<GetRotationHingeCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getRotationHinge",
      .displayName = "Get Node Rotation",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose = "Logs the hinge angle of the first selected labelling bone.",
      .example = "getRotationHinge",
      .argsText = "About its major axis at the current time, in radians.",
      .solo = Solo::no};

  bool execute(Given const&, Args const&, Variable&) override;
};

bool GetRotationHingeCmd::execute(Given const&, Args const&, Variable&) {
  LabelingBone const* bone = selectedLabelingBone();
  if (!bone) return false;
  TalixRotation const rotation = bone->getLocalRot(HTimeManager::getInstance()->getTime());
  g_db->logInfo("Major angle: %f", rotation.getAsHingeRotation(bone->getMajorAxisIndex()));
  return true;
}

}  // namespace

Command* newGetRotationHingeCmd() { return new (std::nothrow) GetRotationHingeCmd; }
