#include "commands/transforms/TransformWriting.h"
#include "host/command/Angles.h"

namespace {

class SetRotationCmd final : public ScriptCommand<SetRotationCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "setRotation",
      .displayName = "Set Node Rotation",
      .category = "Data Editing",
      .subCategory = "Data Manipulators",
      .purpose = "Turns a node to three angles in degrees, local or in the world.",
      .args = {"\"moduleName\" rotVec", 2, 2, {Variable::String, Variable::Vector}},
      .options = {{"ws"}, {"preRot", 0, Variable::None, 4}, {"def", 0, Variable::None, 2}},
      .solo = Solo::no};
  static constexpr WriteOptions kOptions = {info.option("ws"), info.option("def"), info.option("preRot")};

  bool execute(Given const& given, Args const& args, Variable&) override;
};

bool SetRotationCmd::execute(Given const& given, Args const& args, Variable&) {
  TransformWrite write;
  if (!readWrite(given, args, kOptions, info.name, write)) return false;
  // Kept: XYZ whatever the node's own order, which "getRotation" reads in.
  return writeRotation(write, rotationFromDegrees(write.vector, TalixRotation::XYZ));
}

}  // namespace

Command* newSetRotationCmd() { return new (std::nothrow) SetRotationCmd; }
