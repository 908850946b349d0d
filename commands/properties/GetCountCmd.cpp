#include "host/command/Results.h"
#include "host/command/ScriptCommand.h"

namespace {

class GetCountCmd final : public ScriptCommand<GetCountCmd> {
 public:
  static constexpr CommandInfo info = {.name = "getCount",
                                       .displayName = "Get Array Size",
                                       .category = "Data Editing",
                                       .subCategory = "Data Retrieval",
                                       .purpose = "Counts the items of an array.",
                                       .example = "getCount [LFHD RFHD]",
                                       .args = {"array", 1, 1},
                                       .argsText = "A value that is no array counts 1.",
                                       .returns = Variable::Int,
                                       .solo = Solo::no};

  bool execute(Given const&, Args const& args, Variable& result) override;
};

bool GetCountCmd::execute(Given const&, Args const& args, Variable& result) {
  return answer(result, args[0].getNumItems());
}

}  // namespace

Command* newGetCountCmd() { return new (std::nothrow) GetCountCmd; }
