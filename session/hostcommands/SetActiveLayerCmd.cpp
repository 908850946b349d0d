#include "host/command/ScriptCommand.h"
#include "host/scene/Database.h"

namespace talix {

namespace {

class SetActiveLayerCmd final : public ScriptCommand<SetActiveLayerCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "setActiveLayer",
      .displayName = "Set Active Layer",
      .category = "Data Editing",
      .subCategory = "Data Manipulators",
      .purpose = "Makes a layer of the active clip the one that is edited, from 0.",
      .example = "setActiveLayer 0",
      .args = {"N", 1, 1, {Variable::Int}},
      .argsText = "N counts from 0, the base layer."};

  bool execute(Given const&, Args const& args, Variable&) override {
    if (!g_db->getActiveClip()) {
      logError("No clip is active.");
      return false;
    }
    int const layer = args[0].getIntValue(-1);
    if (g_db->setActiveLayer(layer)) return true;
    logError("The active clip has no layer %d; its layers are 0 to %d.", layer,
             g_db->getActiveClip()->getNumLayers() - 1);
    return false;
  }
};

}  // namespace

Command* newSetActiveLayerCmd() { return new SetActiveLayerCmd; }

}  // namespace talix
