#include "commands/transforms/JointBone.h"
#include "commands/transforms/TransformWriting.h"
#include "host/scene/HTimeManager.h"

namespace {

class SetRotationHardyCmd final : public ScriptCommand<SetRotationHardyCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "setRotationHardy",
      .displayName = "Set Node Rotation",
      .category = "Data Editing",
      .subCategory = "Data Manipulators",
      .purpose = "Sets the two joint angles of the first selected labelling bone, in radians.",
      .example = "setRotationHardy 0.5 0.25",
      .args = {nullptr, 2, 2, {Variable::Float, Variable::Float}},
      .argsText =
          "The angles about the bone's major and minor axis, with a point: 1.0. Keys the current time.",
      .solo = Solo::no};

  bool execute(Given const&, Args const& args, Variable&) override;
};

bool SetRotationHardyCmd::execute(Given const&, Args const& args, Variable&) {
  LabelingBone* bone = selectedLabelingBone();
  double const major = args[0].getFloatValue(-1), minor = args[1].getFloatValue(-1);
  if (!bone || !areFinite({major, minor, 0}, info.name)) return false;
  TalixRotation rotation;
  rotation.setAsHardySpicerRotation(major, minor, bone->getMajorAxisIndex(), bone->getMinorAxisIndex(),
                                    bone->getPreRotation());
  if (isWritable(*bone->getRotationChannel(), false))
    bone->setLocalRot(HTimeManager::getInstance()->getTime(), rotation);
  return true;
}

}  // namespace

Command* newSetRotationHardyCmd() { return new (std::nothrow) SetRotationHardyCmd; }
