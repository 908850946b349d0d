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
      .args = {"\"moduleName\" angleAxisRotation", 2, 2, {Variable::String, Variable::Vector}},
      .options = {{"ws"}, {"preRot", 0, Variable::None, 4}, {"def", 0, Variable::None, 2}},
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
