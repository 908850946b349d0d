#include "commands/keys/KeyTargets.h"

namespace {

class GetSelectedKeysCmd final : public ScriptCommand<GetSelectedKeysCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getSelectedKeys",
      .displayName = "Get Selected Key Times",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose = "Lists the frames of the selected keys of a channel.",
      .example = "getSelectedKeys Translation -onMod LFHD",
      .args = {"propertyName", 1, 1, {Variable::String}},
      .argsText =
          "propertyName is a channel, or a component of one (tx, Translation.x) that must be selected. In "
          "the active layer; with no active clip a warning and no result.",
      .options = {{"onMod", "path of the module; else the primary selected one", 1, Variable::String}},
      .returns = Variable::IntArray,
      .solo = Solo::no};

  bool execute(Given const& given, Args const& args, Variable& result) override;
};

// Keys come in order of time, so the list ascends in whatever order they were selected.
bool isSelected(KeyTrack::Key const& key, unsigned mask) { return (key.selected & mask) != 0; }

bool GetSelectedKeysCmd::execute(Given const& given, Args const& args, Variable& result) {
  constexpr KeyQueryTexts texts = {
      .noKeys = "No selected keys on Base Clip",
      .badPath = "%s  is not a valid unique path to a Module in the scene."};  // two spaces: kept
  return queryKeys(args, given, info.option("onMod"), texts, [&](Controller const& channel, unsigned mask) {
    return answer(result, framesOf(channel, mask, isSelected));
  });
}

}  // namespace

Command* newGetSelectedKeysCmd() { return new (std::nothrow) GetSelectedKeysCmd; }
