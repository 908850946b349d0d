#include "host/command/ScriptCommand.h"
#include "host/scene/Database.h"

namespace talix {

namespace {

class AddLayerCmd final : public ScriptCommand<AddLayerCmd> {
 public:
  static constexpr CommandInfo info = {.name = "addLayer",
                                       .displayName = "Add Layer",
                                       .category = "Data Editing",
                                       .subCategory = "Data Manipulators",
                                       .purpose = "Adds a layer to the active clip and makes it active.",
                                       .example = "addLayer",
                                       .argsText =
                                           "Above those that are there. What is keyed in it adds to the "
                                           "layers below. Refused with no active clip."};

  bool execute(Given const&, Args const&, Variable&) override {
    NLEClip* clip = g_db->getActiveClip();
    if (!clip) {
      logError("No clip is active.");
      return false;
    }
    g_db->setActiveLayer(clip->addLayer());
    return true;
  }
};

}  // namespace

Command* newAddLayerCmd() { return new AddLayerCmd; }

}  // namespace talix
