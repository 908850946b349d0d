#include "host/command/Targets.h"
#include "host/scene/HTimeManager.h"

namespace {

class SetTimeCodeOffsetCmd final : public ScriptCommand<SetTimeCodeOffsetCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "setTimeCodeOffset",
      .displayName = "Set Time Code Offset",
      .category = "Data Editing",
      .purpose = "Sets the timecode offset of the active clip, or of a named one, in frames.",
      .example = "setTimeCodeOffset 100 -onClip walk",
      .args = {"offset", 1, 1, {Variable::Int}},
      .argsText = "offset is a whole number of frames.",
      .options = {{"onClip", "path of the clip; else the active one", 1, Variable::String}}};

  static constexpr int kOnClip = info.option("onClip");

  bool execute(Given const& given, Args const& args, Variable&) override {
    NLEClip* target = g_db->getActiveClip();
    if (GivenOptions const options(given); options.has(kOnClip)) {
      target = moduleAt<Clip>(options.textOr(kOnClip, ""), "%s is not a Clip in the scene");
      if (!target) return false;
    }
    if (!target) {
      logError("No active Clip to set timecode offset on");
      return false;
    }
    auto* clip = objectAs<Clip>(target);
    if (!clip) {
      logError("Cannot set timecode offset on Blend types");
      return false;
    }
    clip->setSmpteOffset(HTimeManager::getInstance()->getTime(args[0].getIntValue(-1)));
    return true;
  }
};

}  // namespace

Command* newSetTimeCodeOffsetCmd() { return new (std::nothrow) SetTimeCodeOffsetCmd; }
