#include "host/command/Arguments.h"
#include "host/command/Targets.h"

namespace talix {

namespace {

class SelectCmd final : public ScriptCommand<SelectCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "select",
      .displayName = "Select Modules",
      .category = "Data Editing",
      .subCategory = "Data Manipulators",
      .purpose = "Selects modules by path, by class or all; -primary names the primary one.",
      .example = "select LFHD RFHD -add",
      .args = {"[PATH...]", 0, ArgsInfo::kAny},
      .argsText =
          "Paths, or arrays of them. They become the selection in this order, and the last the primary "
          "module. Paths that are not there, or fit several modules, are refused, and nothing changes.",
      .options = {
          {"add", "keeps the selection and adds to it", 0, Variable::None, 0b110},
          {"remove", "takes them out of the selection", 0, Variable::None, 0b101},
          {"toggle", "selects those that are not selected, and deselects the others", 0, Variable::None,
           0b011},
          {"all", "every module of the scene, or of the class of -type", 0, Variable::None, 0b10000},
          {"none", "empties the selection first", 0, Variable::None, 0b01000},
          {"type", "class name, subclasses too: paths must name such; without paths all of them are meant", 1,
           Variable::String},
          {"primary", "path of the module to make primary, which is selected too; \"\" for none", 1,
           Variable::String}}};
  static constexpr int kAdd = info.option("add"), kRemove = info.option("remove"),
                       kToggle = info.option("toggle"), kAll = info.option("all"),
                       kNone = info.option("none"), kType = info.option("type"),
                       kPrimary = info.option("primary");

  bool checkArgSyntax(Args const& args, Given const& options) const override {
    return (args.getCount() > 0 || options.getCount() > 0) && areTexts(args);
  }

  // Everything is looked up before anything changes.
  bool execute(Given const& given, Args const& args, Variable&) override {
    GivenOptions const options(given);
    HRuntimeClass const* type = nullptr;
    if (options.has(kType) && !(type = typeNamed(options.textOr(kType, "")))) return false;
    int const extent = lastOf(given, kAll, kNone);
    bool const byClass = extent == kAll || (type && args.getCount() == 0 && extent != kNone);
    std::vector<Module*> chosen;
    if (byClass)
      eachModule(Among::all, [&](Module& module) {
        if (!type || module.isKindOf(type)) chosen.push_back(&module);
      });
    if (!addNamed(args, type, chosen)) return false;
    bool const setPrimary = options.has(kPrimary);
    HString const primaryPath = options.textOr(kPrimary, "");
    Module* primary = nullptr;
    if (!primaryPath.IsEmpty() && !(primary = moduleAt(primaryPath))) return false;

    int const mode = lastOf(given, kAdd, kRemove, kToggle);
    bool const replaces = mode < 0 && (byClass || args.getCount() > 0);
    if (extent == kNone || replaces) g_db->selectAllModules(false);
    for (Module* module : chosen)
      module->setSelected(mode == kToggle ? !module->isSelected() : mode != kRemove);
    if (setPrimary) g_db->setPrimarySelectedModule(primary);
    if (byClass) logInfo("%d modules are selected", g_db->getNumSelectedModules());
    return true;
  }

 private:
  // Which of some options was given last; -1: none.
  template <class... Indices>
  static int lastOf(Given const& given, Indices... indices) {
    int last = -1;
    for (CommandOption const& option : given)
      if (((option.getIndex() == indices) || ...)) last = option.getIndex();
    return last;
  }

  static HRuntimeClass const* typeNamed(HString const& name) {
    HRuntimeClass const* type = HRuntimeClass::findClass(name.GetStr());
    if (type && type->isDerivedFrom(&Module::s_classModule)) return type;
    logError("Unknown module type name: %s", name.GetStr());
    return nullptr;
  }

  static bool addNamed(Args const& args, HRuntimeClass const* type, std::vector<Module*>& modules) {
    for (Variable const& arg : args) {
      for (int i = 0; i < arg.getNumItems(); ++i) {
        char const* path = arg.getStringValue(i);
        Module* module = g_db->getModuleWithPath(path, type, false);
        if (!module) {
          logError("%s is not a valid unique path to a %s in the scene.", path,
                   type ? type->getName() : "Module");
          return false;
        }
        modules.push_back(module);
      }
    }
    return true;
  }
};

}  // namespace

Command* newSelectCmd() { return new SelectCmd; }

}  // namespace talix
