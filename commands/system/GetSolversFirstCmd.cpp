#include "host/command/Results.h"
#include "host/command/ScriptCommand.h"
#include "host/scene/Database.h"

namespace {

class GetSolversFirstCmd final : public ScriptCommand<GetSolversFirstCmd> {
 public:
  static constexpr CommandInfo info = {.name = "getSolversFirst",
                                       .displayName = "Get Solvers First Status",
                                       .category = "Skeletal Solving",
                                       .purpose = "Tells whether solvers are evaluated before clips.",
                                       .example = "getSolversFirst",
                                       .returns = Variable::Bool};

  bool execute(Given const&, Args const&, Variable& result) override {
    return answer(result, g_db->getUpdateSolversBeforeClips());
  }
};

}  // namespace

Command* newGetSolversFirstCmd() { return new (std::nothrow) GetSolversFirstCmd; }
