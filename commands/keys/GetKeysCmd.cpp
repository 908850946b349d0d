#include "commands/keys/KeyTargets.h"

namespace {

class GetKeysCmd final : public ScriptCommand<GetKeysCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getKeys",
      .displayName = "Get Key Times",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose = "Lists the frames at which a channel has keys.",
      .example = "getKeys tx -onMod LFHD",
      .args = {"propertyName", 1, 1, {Variable::String}},
      .argsText =
          "propertyName is a channel, or a component of one (tx, Translation.x) that the keys must hold. In "
          "the active layer; with no active clip a warning and no result.",
      .options = {{"onMod", "path of the module; else the primary selected one", 1, Variable::String}},
      .returns = Variable::IntArray,
      .solo = Solo::no};

  bool execute(Given const& given, Args const& args, Variable& result) override;
};

bool holds(KeyTrack::Key const& key, unsigned mask) { return (key.components & mask) == mask; }

bool GetKeysCmd::execute(Given const& given, Args const& args, Variable& result) {
  constexpr KeyQueryTexts texts = {.noKeys = "No keys on Base Clip"};
  return queryKeys(args, given, info.option("onMod"), texts, [&](Controller const& channel, unsigned mask) {
    return answer(result, framesOf(channel, mask, holds));
  });
}

}  // namespace

Command* newGetKeysCmd() { return new (std::nothrow) GetKeysCmd; }
