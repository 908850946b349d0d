#include "host/command/ScriptCommand.h"
#include "host/scene/Database.h"

namespace {

class SetPriorityCmd final : public ScriptCommand<SetPriorityCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "setPriority",
      .displayName = "Set Priority Node",
      .category = "Data Editing",
      .subCategory = "Data Manipulators",
      .purpose = "Makes the primary selected module the one below which short paths are looked for first.",
      .example = "setPriority",
      .argsText = "Without a primary selected module the priority is given up."};

  bool execute(Given const&, Args const&, Variable&) override;
};

bool SetPriorityCmd::execute(Given const&, Args const&, Variable&) {
  Module* module = g_db->getPrimarySelectedModule();
  g_db->setPrioritySearchModule(module);
  if (module)
    logInfo("\"%s\" set as priority module", module->getName().GetStr());
  else
    logInfo("Priority search module reset");
  return true;
}

}  // namespace

Command* newSetPriorityCmd() { return new (std::nothrow) SetPriorityCmd; }
