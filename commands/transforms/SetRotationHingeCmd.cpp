#include "commands/transforms/JointBone.h"
#include "commands/transforms/TransformWriting.h"
#include "host/scene/HTimeManager.h"

namespace {

class SetRotationHingeCmd final : public ScriptCommand<SetRotationHingeCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "setRotationHinge",
      .displayName = "Set Node Rotation",
      .category = "Data Editing",
      .subCategory = "Data Manipulators",
      .purpose = "Sets the hinge angle of the first selected labelling bone, in radians.",
      .example = "setRotationHinge 0.5",
      .args = {nullptr, 1, 1, {Variable::Float}},
      .argsText = "The angle about the bone's major axis, with a point: 1.0. Keys the current time.",
      .solo = Solo::no};

  bool execute(Given const&, Args const& args, Variable&) override;
};

bool SetRotationHingeCmd::execute(Given const&, Args const& args, Variable&) {
  LabelingBone* bone = selectedLabelingBone();
  double const angle = args[0].getFloatValue(-1);
  if (!bone || !areFinite({angle, 0, 0}, info.name)) return false;
  TalixRotation rotation;
  rotation.setAsHingeRotation(angle, bone->getMajorAxisIndex());
  if (isWritable(*bone->getRotationChannel(), false))
    bone->setLocalRot(HTimeManager::getInstance()->getTime(), rotation);
  return true;
}

}  // namespace

Command* newSetRotationHingeCmd() { return new (std::nothrow) SetRotationHingeCmd; }
