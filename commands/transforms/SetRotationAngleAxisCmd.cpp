#include "commands/transforms/TransformWriting.h"

namespace {

class SetRotationAngleAxisCmd final : public ScriptCommand<SetRotationAngleAxisCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "setRotationAngleAxis",
      .displayName = "Set Node Rotation",
      .category = "Data Editing",
      .subCategory = "Data Manipulators",
      .purpose = "Turns a node by a vector along the axis, as long as the angle in radians.",
      .example = "setRotationAngleAxis Hips <0 0 1.57>",
      .args = {"\"moduleName\" angleAxisRotation", 2, 2, {Variable::String, Variable::Vector}},
      .argsText =
          "moduleName is the path of a node; the vector is the channel's own value unless -ws. Keys the "
          "current time in the active layer; with no active clip it sets the default value.",
      .options = {{"ws", "the vector is in the world"},
                  {"preRot", "sets the pre-rotation, the fixed rotation before the channels, as well", 0,
                   Variable::None, 4},
                  {"def", "sets the default value of the channel instead of a key", 0, Variable::None, 2}},
      .solo = Solo::no};
  static constexpr WriteOptions kOptions = {info.option("ws"), info.option("def"), info.option("preRot")};

  bool execute(Given const& given, Args const& args, Variable&) override;
};

bool SetRotationAngleAxisCmd::execute(Given const& given, Args const& args, Variable&) {
  TransformWrite write;
  return readWrite(given, args, kOptions, info.name, write) &&
         writeRotation(write, TalixRotation(write.vector));
}

}  // namespace

Command* newSetRotationAngleAxisCmd() { return new (std::nothrow) SetRotationAngleAxisCmd; }
