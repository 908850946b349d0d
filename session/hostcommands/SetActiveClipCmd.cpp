#include "host/command/Targets.h"

namespace talix {

namespace {

class SetActiveClipCmd final : public ScriptCommand<SetActiveClipCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "setActiveClip",
      .displayName = "Set Active Clip",
      .category = "Data Editing",
      .subCategory = "Data Manipulators",
      .purpose = "Makes a clip the active one; -none goes back to the base clip.",
      .example = "setActiveClip walk",
      .args = {"[PATH]", 0, 1, {Variable::String}},
      .argsText = "The path of a clip; its lowest layer becomes active.",
      .options = {{"none", "no clip is active: values are the default ones, and no keys are there"}}};

  // A path or -none, not both.
  bool checkArgSyntax(Args const& args, Given const& options) const override {
    return fits(info.args, args) && (args.getCount() > 0) != (options.getCount() > 0);
  }

  bool execute(Given const&, Args const& args, Variable&) override {
    NLEClip* clip = nullptr;
    if (args.getCount() > 0) {
      clip = moduleAt<NLEClip>(args[0].getStringValue(-1),
                               "%s is not a valid unique path to a Clip in the scene.");
      if (!clip) return false;
    }
    g_db->setActiveClip(clip);
    return true;
  }
};

}  // namespace

Command* newSetActiveClipCmd() { return new SetActiveClipCmd; }

}  // namespace talix
