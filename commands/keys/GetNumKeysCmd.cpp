#include "commands/keys/KeyTargets.h"

namespace {

class GetNumKeysCmd final : public ScriptCommand<GetNumKeysCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getNumKeys",
      .displayName = "Get Number of Keys",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose = "Counts the keys of a channel, or only the selected ones.",
      .example = "getNumKeys Translation -s -onMod LFHD",
      .args = {"propertyName", 1, 1, {Variable::String}},
      .argsText =
          "propertyName is a channel, or a component of one (tx, Translation.x) that the keys must hold. In "
          "the active layer; with no active clip a warning and no result.",
      .options = {{"s", "only the selected keys"},
                  {"onMod", "path of the module; else the primary selected one", 1, Variable::String}},
      .returns = Variable::Int,
      .solo = Solo::no};

  bool execute(Given const& given, Args const& args, Variable& result) override;
};

bool GetNumKeysCmd::execute(Given const& given, Args const& args, Variable& result) {
  constexpr KeyQueryTexts texts = {.noKeys = "No keys on Base Clip"};
  bool const selected = GivenOptions(given).has(info.option("s"));
  return queryKeys(args, given, info.option("onMod"), texts, [&](Controller const& channel, unsigned mask) {
    if (mask == KeyTrack::kAll || isOneValued(channel))
      return answer(result, selected ? channel.getNumSelectedKeys() : channel.getNumKeys());
    return answer(result, selected ? channel.getNumSelectedKeys(mask) : channel.getNumKeys(mask));
  });
}

}  // namespace

Command* newGetNumKeysCmd() { return new (std::nothrow) GetNumKeysCmd; }
