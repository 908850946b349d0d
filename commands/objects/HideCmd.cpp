#include "host/command/Targets.h"

namespace {

class HideCmd final : public ScriptCommand<HideCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "hide",
      .displayName = "Hide",
      .category = "Data Editing",
      .subCategory = "Data Manipulators",
      .purpose = "Hides modules: the named ones, the selected ones, or all.",
      .example = "hide LFHD RFHD -t",
      .args = {"[\"name1\" \"name2\" ...]", 0, ArgsInfo::kAny, {}, Variable::String},
      .argsText =
          "Hides the named modules; without names the selected ones, or those of an option (the last one "
          "counts). -u hides the unselected, -all everything, -t toggles instead of hiding.",
      .options = {
          {"s", "deprecated: the selection is what is hidden without an option", 0, Variable::None, 6, true},
          {"u", "every module that is not selected; no effect with names", 0, Variable::None, 5},
          {"primary", "only the primary selected module; no effect with names", 0, Variable::None, 3},
          {"t", "shows those of them that are hidden"},
          {"all", "every module of the scene; no effect with names", 0, Variable::None, 6, true}}};

  static constexpr int kDeprecated = info.option("s"), kUnselected = info.option("u"),
                       kPrimary = info.option("primary"), kToggle = info.option("t"),
                       kAll = info.option("all");

  bool execute(Given const& given, Args const& args, Variable&) override {
    GivenOptions const options(given);
    if (options.has(kDeprecated))
      logWarning(
          "The -s option on the hide command is deprecated. hide now operates on selection by default.");
    TSimpleArray<Module*> modules;
    if (args.getCount() == 0) {
      collect(given, modules);
    } else {
      for (Variable const& arg : args) {
        Module* module = moduleAt(arg.getStringValue(-1));
        if (!module) return false;
        modules.add(module);
      }
    }
    for (int i = 0; i < modules.getCount(); ++i)
      modules[i]->setVisible(options.has(kToggle) && !modules[i]->isVisible(), true);
    return true;
  }

 private:
  // The last of the options that choose decides; without any it is the selection.
  static void collect(Given const& given, TSimpleArray<Module*>& modules) {
    int mode = kDeprecated;
    for (CommandOption const& option : given)
      if (option.getIndex() != kToggle) mode = option.getIndex();
    if (mode == kPrimary) {
      if (Module* primary = g_db->getPrimarySelectedModule()) modules.add(primary);
      return;
    }
    eachModule(mode == kDeprecated ? Among::selected : Among::all, [&](Module& module) {
      if (mode != kUnselected || !module.isSelected()) modules.add(&module);
    });
  }
};

}  // namespace

Command* newHideCmd() { return new (std::nothrow) HideCmd; }
