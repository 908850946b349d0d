#include "commands/transforms/TransformWriting.h"
#include "host/scene/DataEdit.h"
#include "host/scene/Marker.h"

namespace {

class SetPositionCmd final : public ScriptCommand<SetPositionCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "setPosition",
      .displayName = "Set Node Position",
      .category = "Data Editing",
      .subCategory = "Data Manipulators",
      .purpose = "Moves a node to a position in millimetres, local or in the world.",
      .args = {"\"moduleName\" posVec", 2, 2, {Variable::String, Variable::Vector}},
      .options = {{"ws"}, {"preTrans", 0, Variable::None, 4}, {"default", 0, Variable::None, 2}},
      .solo = Solo::no};
  static constexpr WriteOptions kOptions = {info.option("ws"), info.option("default"),
                                            info.option("preTrans")};

  bool execute(Given const& given, Args const& args, Variable&) override;
};

// False when nothing could be written.
bool writePosition(TransformWrite const& write) {
  Node& node = *write.node;
  if (write.preTransform) {
    if (!isFree(obstacleToPreTransform(node), "Pre-translation", node)) return false;
    write.world ? node.setPreTranslationWS(write.vector)
                : static_cast<void>(node.setPreTranslation(write.vector));
    return true;
  }
  Controller* channel = node.getTranslationChannel();
  if (!isWritable(*channel, write.byDefault)) return false;
  if (write.byDefault) {
    DataEdit const edit = DataEdit::ofDefault(*channel);
    write.world ? node.setConstWSPos(write.vector) : node.setConstLocalPos(write.vector);
  } else {
    DataEdit const edit(*channel, write.edited());
    write.world ? node.setWSPos(write.time, write.vector) : node.setLocalPos(write.time, write.vector);
  }
  return true;
}

bool SetPositionCmd::execute(Given const& given, Args const& args, Variable&) {
  TransformWrite write;
  if (!readWrite(given, args, kOptions, info.name, write)) return false;
  auto* marker = objectAs<Marker>(write.node);
  // Kept: whatever the options were.
  if (writePosition(write) && marker) marker->setFillType(write.time, Marker::EditedByHand, true);
  return true;
}

}  // namespace

Command* newSetPositionCmd() { return new (std::nothrow) SetPositionCmd; }
