#include "commands/ChannelValues.h"
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
      .example = "setPosition LFHD <100 200 1500> -ws",
      .args = {"\"moduleName\" posVec", 2, 2, {Variable::String, Variable::Vector}},
      .argsText =
          "moduleName is the path of a node, posVec <x y z>: the channel's own value unless -ws. Keys the "
          "current time in the active layer; with no active clip it sets the default value. Where the "
          "channel is locked there is a warning and nothing changes. A marker's frame is marked as edited by "
          "hand, whatever the options.",
      .options = {{"ws", "posVec is in the world"},
                  {"preTrans", "sets the pre-translation, the fixed offset before the channels, instead", 0,
                   Variable::None, 4},
                  {"default", "sets the default value of the channel instead", 0, Variable::None, 2}},
      .solo = Solo::no};
  static constexpr WriteOptions kOptions = {info.option("ws"), info.option("default"),
                                            info.option("preTrans")};

  bool execute(Given const& given, Args const& args, Variable&) override;
};

bool mayWrite(TransformWrite const& write) {
  return write.preTransform ? isFree(obstacleToPreTransform(*write.node), "Pre-translation", *write.node)
                            : isWritable(*write.node->getTranslationChannel(), write.byDefault);
}

// False, with a message, when the value cannot be held.
bool writePosition(TransformWrite const& write) {
  Node& node = *write.node;
  Vec3 const& position = write.vector;
  if (write.preTransform)
    return isHeld(write.world ? node.setPreTranslationWS(position) : node.setPreTranslation(position),
                  "Pre-translation", node);
  Controller* channel = node.getTranslationChannel();
  if (write.byDefault) {
    DataEdit const edit = DataEdit::ofDefault(*channel);
    return isHeld(write.world ? node.setConstWSPos(position) : node.setConstLocalPos(position), "Translation",
                  node);
  }
  DataEdit const edit(*channel, write.edited());
  return isHeld(write.world ? node.setWSPos(write.time, position) : node.setLocalPos(write.time, position),
                "Translation", node);
}

bool SetPositionCmd::execute(Given const& given, Args const& args, Variable&) {
  TransformWrite write;
  if (!readWrite(given, args, kOptions, info.name, write)) return false;
  if (!mayWrite(write)) return true;
  if (!writePosition(write)) return false;
  // Kept: whatever the options were.
  if (auto* marker = objectAs<Marker>(write.node))
    marker->setFillType(write.time, Marker::EditedByHand, true);
  return true;
}

}  // namespace

Command* newSetPositionCmd() { return new (std::nothrow) SetPositionCmd; }
