#include "host/command/ScriptCommand.h"
#include "host/scene/Database.h"
#include "io/TakeFormats.h"
#include "io/TakeScene.h"
#include "session/hostcommands/TakeNotes.h"

namespace talix {

namespace {

class SaveCmd final : public ScriptCommand<SaveCmd> {
 public:
  static constexpr CommandInfo info = {.name = "save",
                                       .displayName = "Save Take",
                                       .category = "System",
                                       .purpose =
                                           "Writes the active clip over the animation range to a file; the "
                                           "suffix (.c3d, .bvh) names the format.",
                                       .example = "save clean.c3d",
                                       .args = {"FILE", 1, 1, {Variable::String}},
                                       .argsText =
                                           "A file that is there is replaced. A clip from a file keeps its "
                                           "own frames unless setAnimRange was used."};

  // Throws FileError: the runner makes it the error line, and a failure of the file rather than of the
  // command.
  bool execute(Given const&, Args const& args, Variable&) override {
    std::vector<TakeNote> notes;
    writeTake(exportTake(*g_db, notes), args[0].getStringValue(-1), notes);
    logNotes(notes);
    return true;
  }
};

}  // namespace

Command* newSaveCmd() { return new SaveCmd; }

}  // namespace talix
