#include "host/scene/Database.h"
#include "session/hostcommands/Arguments.h"

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
      .args = {"[PATH]", 0, 1, {Variable::String}},
      .options = {{"none"}}};

  // A path or -none, not both.
  bool checkArgSyntax(Args const& args, Given const& options) const override {
    return fits(info.args, args) && (args.getCount() > 0) != (options.getCount() > 0);
  }

  bool execute(Given const&, Args const& args, Variable&) override {
    Module* clip = nullptr;
    if (args.getCount() > 0) {
      HString const path = args[0].getStringValue(-1);
      clip = g_db->getModuleWithPath(path, &NLEClip::s_classNLEClip, false);
      if (!clip) {
        logError("%s is not a valid unique path to a Clip in the scene.", path.GetStr());
        return false;
      }
    }
    g_db->setActiveClip(static_cast<NLEClip*>(clip));
    return true;
  }
};

}  // namespace

Command* newSetActiveClipCmd() { return new SetActiveClipCmd; }

}  // namespace talix
