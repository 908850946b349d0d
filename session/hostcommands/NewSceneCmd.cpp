#include "host/command/ScriptCommand.h"
#include "host/scene/Database.h"

namespace talix {

namespace {

class NewSceneCmd final : public ScriptCommand<NewSceneCmd> {
 public:
  static constexpr CommandInfo info = {.name = "newScene",
                                       .displayName = "New Scene",
                                       .category = "System",
                                       .purpose = "Empties the scene and sets rate, time and ranges back.",
                                       .example = "newScene",
                                       .argsText = "Cannot be undone, and does not ask."};

  bool execute(Given const&, Args const&, Variable&) override {
    g_db->newScene();
    return true;
  }
};

}  // namespace

Command* newNewSceneCmd() { return new NewSceneCmd; }

}  // namespace talix
