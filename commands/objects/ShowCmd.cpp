#include "host/command/Arguments.h"
#include "host/command/Targets.h"

namespace {

class ShowCmd final : public ScriptCommand<ShowCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "show",
      .displayName = "Show",
      .category = "Data Editing",
      .subCategory = "Data Manipulators",
      .purpose = "Shows hidden modules: the named ones, or the selected ones.",
      .example = "show LFHD RFHD",
      .args = {"name1 name2 ..."},
      .argsText = "Shows the named modules; without names the selected ones. Arrays of paths will do.",
      .options = {{"s", "the selected modules, as without names; refused beside names"}}};

  bool checkArgSyntax(Args const& args, Given const&) const override { return areTexts(args); }

  static constexpr int kSelected = info.option("s");

  bool execute(Given const& given, Args const& args, Variable&) override {
    if (args.getCount() > 0 && GivenOptions(given).has(kSelected)) {
      logError("Cannot specify -s and pass in arguments");
      return false;
    }
    TSimpleArray<Module*> modules;
    if (!readModules(args, modules)) return false;
    for (int i = 0; i < modules.getCount(); ++i) modules[i]->setVisible(true, true);
    return true;
  }

 private:
  // The named modules; without names the selected ones.
  static bool readModules(Args const& args, TSimpleArray<Module*>& modules) {
    for (Variable const& arg : args)
      for (int i = 0; i < arg.getNumItems(); ++i) {
        Module* module = moduleAt(arg.getStringValue(arg.isArray() ? i : -1));
        if (!module) return false;
        modules.add(module);
      }
    if (args.getCount() == 0) eachModule(Among::selected, [&](Module& module) { modules.add(&module); });
    return true;
  }
};

}  // namespace

Command* newShowCmd() { return new (std::nothrow) ShowCmd; }
