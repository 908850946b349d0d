#include "host/command/Results.h"
#include "host/command/ScriptCommand.h"
#include "host/scene/Database.h"
#include "host/scene/HTimeManager.h"

namespace {

class GetTimeCodeOffsetCmd final : public ScriptCommand<GetTimeCodeOffsetCmd> {
 public:
  static constexpr CommandInfo info = {.name = "getTimeCodeOffset",
                                       .displayName = "Get Time Code Offset",
                                       .category = "Data Editing",
                                       .purpose = "The timecode offset of the active clip in frames.",
                                       .example = "getTimeCodeOffset",
                                       .argsText = "0 with no active clip.",
                                       .returns = Variable::Int};

  bool execute(Given const&, Args const&, Variable& result) override {
    auto const* clip = objectAs<Clip>(g_db->getActiveClip());
    return answer(result, clip ? HTimeManager::getInstance()->getFrame(clip->getSmpteOffset()) : 0);
  }
};

}  // namespace

Command* newGetTimeCodeOffsetCmd() { return new (std::nothrow) GetTimeCodeOffsetCmd; }
