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
      .example = "setRotation Hips <0 45 0>",
      .args = {"\"moduleName\" rotVec", 2, 2, {Variable::String, Variable::Vector}},
      .argsText =
          "moduleName is the path of a node, rotVec <x y z> in degrees, in XYZ whatever the node's own "
          "order: the channel's own value unless -ws. Keys the current time in the active layer; with no "
          "active clip it sets the default value. Where the channel is locked there is a warning, and it "
          "stays.",
      .options = {{"ws", "rotVec is in the world"},
                  {"preRot", "sets the pre-rotation, the fixed rotation before the channels, as well", 0,
                   Variable::None, 4},
                  {"def", "sets the default value of the channel instead of a key", 0, Variable::None, 2}},
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
