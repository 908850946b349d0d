#include "host/command/Results.h"
#include "host/command/ScriptCommand.h"
#include "session/CommandHelp.h"

namespace talix {

namespace {

class HelpCmd final : public ScriptCommand<HelpCmd> {
 public:
  static constexpr CommandInfo info = {.name = "help",
                                       .displayName = "Help",
                                       .category = "System",
                                       .purpose = "Lists all commands, or tells all about one.",
                                       .example = "help setKey",
                                       .args = {"[NAME]", 0, 1, {Variable::String}},
                                       .argsText = "NAME is that of a command, in exact case.",
                                       .returns = Variable::String};

  explicit HelpCmd(CommandRegistry const& registry) : m_registry(registry) {}

  bool execute(Given const&, Args const& args, Variable& result) override {
    if (args.getCount() == 0) return answer(result, commandList(m_registry).c_str());
    char const* name = args[0].getStringValue(-1);
    CommandRegistry::Entry const* entry = m_registry.find(name);
    if (!entry) {
      logError("Unknown command: %s", name);
      return false;
    }
    return answer(result, commandPage(*entry).c_str());
  }

 private:
  CommandRegistry const& m_registry;
};

}  // namespace

Command* newHelpCmd(CommandRegistry const& registry) { return new HelpCmd(registry); }

}  // namespace talix
