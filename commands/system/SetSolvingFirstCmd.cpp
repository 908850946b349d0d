#include "host/command/Arguments.h"
#include "host/scene/Database.h"

namespace {

class SetSolvingFirstCmd final : public ScriptCommand<SetSolvingFirstCmd> {
 public:
  static constexpr CommandInfo info = {.name = "setSolversFirst",
                                       .displayName = "Set Solvers First Status",
                                       .category = "Interface",
                                       .purpose = "Has solvers evaluated before clips, or after them.",
                                       .example = "setSolversFirst true",
                                       .args = {"boolean", 1, 1, {Variable::Bool}},
                                       .argsText = "true, false or toggle."};

  bool execute(Given const&, Args const& args, Variable&) override {
    Variable::BoolType const wanted = args[0].getBoolValue(-1);
    if (wanted < Variable::False || wanted > Variable::Toggle) return false;
    g_db->setUpdateSolversBeforeClips(changed(g_db->getUpdateSolversBeforeClips(), wanted));
    return true;
  }
};

}  // namespace

Command* newSetSolvingFirstCmd() { return new (std::nothrow) SetSolvingFirstCmd; }
