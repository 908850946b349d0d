#include "session/hostcommands/UndoSteps.h"

namespace talix {

namespace {

class UndoCmd final : public ScriptCommand<UndoCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "undo",
      .displayName = "Undo",
      .category = "System",
      .purpose = "Takes back what the last COUNT lines changed (1 without COUNT).",
      .example = "undo 2",
      .args = {"[COUNT]", 0, 1},
      .argsText =
          "A line that changed something is a step. Current time, files and settings are not taken back."};

  bool checkArgSyntax(Args const& args, Given const&) const override { return isStepCount(args); }

  bool execute(Given const&, Args const& args, Variable&) override {
    goSteps(args, &UndoJournal::undo, "undo", "Undone");
    return true;
  }
};

}  // namespace

Command* newUndoCmd() { return new UndoCmd; }

}  // namespace talix
