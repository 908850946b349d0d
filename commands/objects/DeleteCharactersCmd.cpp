#include "host/command/ScriptCommand.h"
#include "host/scene/Database.h"
#include "host/scene/SubjectManager.h"

namespace {

class DeleteCharactersCmd final : public ScriptCommand<DeleteCharactersCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "deleteCharacters",
      .displayName = "Delete Characters",
      .category = "Data Editing",
      .purpose = "Deletes the selected characters, or all, with their setups.",
      .example = "deleteCharacters -keepLabels",
      .argsText =
          "The selected characters go with all below them, but for the markers: these become unlabeled roots "
          "that move in the world as before.",
      .options = {{"all", "every character of the scene, selected or not"},
                  {"keepLabels",
                   "markers keep their names, prefixed by the character's; without it, and with -all, they "
                   "lose them"}}};
  static constexpr int kAll = info.option("all"), kKeepLabels = info.option("keepLabels");

  bool execute(Given const& given, Args const&, Variable&) override {
    SubjectManager* subjects = g_db->getSubjectManager();
    GivenOptions const options(given);
    bool const all = options.has(kAll);
    if (subjects->getNumSelectedSubjects() == 0 && !all) {
      logWarning("No Characters selected for deletion");
      return true;
    }
    if (all) {
      int const count = static_cast<int>(subjects->getNumSubjects());
      subjects->removeAllSubjects(true, true, true);  // kept: labels go even with "-keepLabels"
      logInfo("%d Characters deleted", count);
      return true;
    }
    TSimpleArray<Character*> selected;
    for (uint64 i = 0; i < subjects->getNumSelectedSubjects(); ++i)
      selected.add(subjects->getSelectedSubject(i));
    for (Character* subject : selected)
      subjects->removeSubject(subject, !options.has(kKeepLabels), true, true);
    logInfo("%d Characters deleted", selected.getCount());
    return true;
  }
};

}  // namespace

Command* newDeleteCharactersCmd() { return new (std::nothrow) DeleteCharactersCmd; }
