#include "commands/markers/MarkerConnections.h"
#include "host/scene/Database.h"

namespace {

class RemoveMarkerConnectionCmd final : public ScriptCommand<RemoveMarkerConnectionCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "removeMarkerConnection",
      .displayName = "Remove Marker Connecting Line",
      .category = "Data Editing",
      .purpose = "Removes the lines between a marker and others, or all of its lines.",
      .example = "removeMarkerConnection LFHD RFHD",
      .args =
          {"\"sourceNode\" [\"targetNode1\" \"targetNode2\"...]", 1, ArgsInfo::kAny, {}, Variable::String},
      .argsText =
          "Paths of nodes. With targets the lines to them, in either direction; without targets all lines "
          "that the source holds. A path that names no node is a warning.",
      .solo = Solo::no};

  bool execute(Given const&, Args const& args, Variable&) override {
    Node* source = nodeAt(args[0], "%s  is not a valid unique path to a Node in the scene.");  // kept
    if (!source) return true;
    if (args.getCount() == 1) source->resetAllLines();
    for (int i = 1; i < args.getCount(); ++i) {
      Node* target = nodeAt(args[i], "%s is not a valid unique path to a Node in the scene.");
      if (!target) return true;
      disconnect(*source, *target);
    }
    return true;
  }

 private:
  static Node* nodeAt(Variable const& path, char const* badPath) {
    auto* node = objectAs<Node>(g_db->getModuleWithPath(path.getStringValue(-1), &Node::s_classNode, false));
    if (!node) logWarning(badPath, path.getStringValue(-1));
    return node;
  }
};

}  // namespace

Command* newRemoveMarkerConnectionCmd() { return new (std::nothrow) RemoveMarkerConnectionCmd; }
