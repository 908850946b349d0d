#include "commands/ChannelValues.h"
#include "commands/transforms/TransformWriting.h"
#include "host/scene/DataEdit.h"

namespace {

class SetScaleCmd final : public ScriptCommand<SetScaleCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "setScale",
      .displayName = "Set Node Scale",
      .category = "Data Editing",
      .subCategory = "Data Manipulators",
      .purpose = "Scales a node along its three axes, local or in the world.",
      .example = "setScale Hips <1 1 2>",
      .args = {"\"moduleName\" scaleVec", 2, 2, {Variable::String, Variable::Vector}},
      .argsText =
          "moduleName is the path of a node, scaleVec <x y z>: the channel's own value unless -ws. Keys the "
          "current time in the active layer; with no active clip it sets the default value. Where the "
          "channel is locked there is a warning and nothing changes.",
      .options = {{"ws", "scaleVec is in the world"},
                  {"def", "sets the default value of the channel instead of a key"}},
      .solo = Solo::no};
  static constexpr WriteOptions kOptions = {info.option("ws"), info.option("def")};

  bool execute(Given const& given, Args const& args, Variable&) override;
};

// The local scale that gives a scale in the world below the parent as it is at a time.
Vec3 localScale(Node const& node, Vec3 const& inWorld, int64 time) {
  Node const* parent = node.getNodeParent();
  return parent ? Transform{{}, {}, inWorld}.relativeTo(parent->getWorldTransform(time)).scale : inWorld;
}

bool SetScaleCmd::execute(Given const& given, Args const& args, Variable&) {
  TransformWrite write;
  if (!readWrite(given, args, kOptions, info.name, write)) return false;
  Node& node = *write.node;
  if (!isWritable(*node.getScaleChannel(), write.byDefault)) return true;
  if (write.byDefault) {
    // Kept: the write of the default value stands in the bracket, the one at a time does not.
    DataEdit const edit(node, write.edited());
    return isHeld(
        node.setConstLocalScale(write.world ? localScale(node, write.vector, write.time) : write.vector),
        "Scale", node);
  }
  return isHeld(
      write.world ? node.setWSScale(write.time, write.vector) : node.setLocalScale(write.time, write.vector),
      "Scale", node);
}

}  // namespace

Command* newSetScaleCmd() { return new (std::nothrow) SetScaleCmd; }
