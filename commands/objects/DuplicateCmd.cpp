#include "host/command/ScriptCommand.h"
#include "host/scene/Database.h"

namespace {

class DuplicateCmd final : public ScriptCommand<DuplicateCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "duplicate",
      .displayName = "Duplicate Object",
      .category = "Data Editing",
      .purpose = "Makes a copy of every selected module.",
      .example = "duplicate",
      .argsText =
          "Children are copied only when they are selected too. Keys of all clips are copied. A copy stands "
          "beside its original under a free name; the copies become the selection.",
      .solo = Solo::yes};

  bool execute(Given const&, Args const&, Variable&) override {
    g_db->duplicateSelectedObjects();
    return true;
  }
};

}  // namespace

Command* newDuplicateCmd() { return new (std::nothrow) DuplicateCmd; }
