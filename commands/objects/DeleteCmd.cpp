#include <algorithm>

#include "host/command/Targets.h"

namespace {

class DeleteCmd final : public ScriptCommand<DeleteCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "delete",
      .displayName = "Delete",
      .category = "Data Editing",
      .purpose = "Deletes the selected modules, or all, with everything below them.",
      .example = "delete -primary",
      .argsText = "Without an option every selected module goes. References to what is deleted are cleared.",
      .options = {
          {"all", "every module of the scene, selected or not: clips, characters and cameras too", 0,
           Variable::None, 2},
          {"primary", "only the primary selected module and what is below it", 0, Variable::None, 1}}};
  static constexpr int kAll = info.option("all"), kPrimary = info.option("primary");

  bool execute(Given const& given, Args const&, Variable&) override {
    GivenOptions const options(given);
    bool const all = options.has(kAll);
    if (g_db->getNumSelectedModules() == 0 && !all) {
      logWarning("No items selected for deletion");
      return true;
    }
    TSimpleArray<Module*> const modules = modulesToDelete(all, options.has(kPrimary));

    bool const autoUpdate = g_db->getAutoUpdateProperties();
    g_db->setAutoUpdateProperties(false);
    // One that went along with its parent is no longer in the scene, which is no matter.
    for (Module* module : modules) g_db->removeFromScene(module, true, true, true, true);
    g_db->setAutoUpdateProperties(autoUpdate);

    logInfo("%d items deleted", modules.getCount());  // kept: without what went along
    return true;
  }

 private:
  static TSimpleArray<Module*> modulesToDelete(bool all, bool primary) {
    int const most = std::max(1, countModules(all ? Among::all : Among::selected));
    TSimpleArray<Module*> modules(most, most);
    if (all || !primary)
      eachModule(all ? Among::all : Among::selected, [&](Module& module) { modules.add(&module); });
    else if (Module* module = g_db->getPrimarySelectedModule())
      modules.add(module);
    return modules;
  }
};

}  // namespace

Command* newDeleteCmd() { return new (std::nothrow) DeleteCmd; }
