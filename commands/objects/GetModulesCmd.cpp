#include "commands/objects/SceneQueries.h"
#include "host/command/Results.h"

namespace {

class GetModulesCmd final : public ScriptCommand<GetModulesCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getModules",
      .displayName = "Get Scene Modules",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose = "Lists the paths of modules: of all, of the selected ones, or of those of a type.",
      .example = "getModules -type Marker -nameOnly",
      .argsText = "Without -selected or -primary every module of the scene, in order of creation.",
      .options = {{"type", "class name; only modules of exactly this class, not of its subclasses", 1,
                   Variable::String},
                  {"primary", "only the primary selected module", 0, Variable::None, 4},
                  {"selected", "only the selected modules, in the order of selection", 0, Variable::None, 2},
                  {"fullPath", "paths from the root; default the shortest that are unique", 0, Variable::None,
                   16},
                  {"nameOnly", "names without paths", 0, Variable::None, 8}},
      .returns = Variable::StringArray};
  static constexpr int kType = info.option("type"), kPrimary = info.option("primary"),
                       kSelected = info.option("selected");

  bool execute(Given const& given, Args const&, Variable& result) override;
};

bool GetModulesCmd::execute(Given const& given, Args const&, Variable& result) {
  GivenOptions const options(given);
  HRuntimeClass const* type = nullptr;
  if (options.has(kType)) {
    type = moduleTypeNamed(options.textOr(kType, ""));
    if (!type) return false;
  }
  // Kept: only modules of exactly this class, whereas getNumModules counts those of its subclasses too.
  std::vector<Module*> found;
  auto const collect = [&](Module& module) {
    if (!type || module.getRuntimeClass() == type) found.push_back(&module);
  };
  if (options.has(kPrimary)) {
    if (Module* primary = g_db->getPrimarySelectedModule()) collect(*primary);
  } else {
    eachModule(options.has(kSelected) ? Among::selected : Among::all, collect);
  }
  return answer(result, pathsOf(found, pathType<GetModulesCmd>(given)));
}

}  // namespace

Command* newGetModulesCmd() { return new (std::nothrow) GetModulesCmd; }
