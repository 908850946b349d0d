#include "session/hostcommands/UndoSteps.h"

namespace talix {

namespace {

class RedoCmd final : public ScriptCommand<RedoCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "redo",
      .displayName = "Redo",
      .category = "System",
      .purpose = "Does again what was undone last, COUNT times (1 without COUNT).",
      .example = "redo",
      .args = {"[COUNT]", 0, 1},
      .argsText = "Only until something else is changed."};

  bool checkArgSyntax(Args const& args, Given const&) const override { return isStepCount(args); }

  bool execute(Given const&, Args const& args, Variable&) override {
    goSteps(args, &UndoJournal::redo, "redo", "Redone");
    return true;
  }
};

}  // namespace

Command* newRedoCmd() { return new RedoCmd; }

}  // namespace talix
