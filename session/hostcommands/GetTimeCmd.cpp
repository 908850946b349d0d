#include "host/command/Results.h"
#include "host/command/ScriptCommand.h"
#include "host/scene/HTimeManager.h"

namespace talix {

namespace {

class GetTimeCmd final : public ScriptCommand<GetTimeCmd> {
 public:
  static constexpr CommandInfo info = {.name = "getTime",
                                       .displayName = "Get Current Time",
                                       .category = "Interface",
                                       .purpose = "The current time in frames.",
                                       .example = "getTime",
                                       .returns = Variable::Float};

  bool execute(Given const&, Args const&, Variable& result) override {
    HTimeManager const& times = *HTimeManager::getInstance();
    return answer(result, times.getFrameDouble(times.getTime()));
  }
};

}  // namespace

Command* newGetTimeCmd() { return new GetTimeCmd; }

}  // namespace talix
