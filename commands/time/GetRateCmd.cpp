#include "host/command/Results.h"
#include "host/command/ScriptCommand.h"
#include "host/scene/HTimeManager.h"

namespace {

class GetRateCmd final : public ScriptCommand<GetRateCmd> {
 public:
  static constexpr CommandInfo info = {.name = "getRate",
                                       .displayName = "Get Scene Rate",
                                       .category = "Data Editing",
                                       .subCategory = "Data Retrieval",
                                       .purpose = "The frame rate of the scene in frames a second.",
                                       .example = "getRate",
                                       .returns = Variable::Float};

  bool execute(Given const&, Args const&, Variable& result) override {
    return answer(result, HTimeManager::getInstance()->getFrameRate().getFrameRate());
  }
};

}  // namespace

Command* newGetRateCmd() { return new (std::nothrow) GetRateCmd; }
