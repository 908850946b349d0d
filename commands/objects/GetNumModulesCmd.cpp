#include "commands/objects/SceneQueries.h"
#include "host/command/Results.h"

namespace {

class GetNumModulesCmd final : public ScriptCommand<GetNumModulesCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getNumModules",
      .displayName = "Get Number of Modules",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose =
          "Counts the modules of the scene, or the selected ones, of any type or of one and its subtypes.",
      .example = "getNumModules -type Marker",
      .argsText = "Without an option every module of the scene counts.",
      .options = {{"type", "class name; modules of its subclasses count too", 1, Variable::String},
                  {"selected", "only the selected modules"}},
      .returns = Variable::Int};
  static constexpr int kType = info.option("type"), kSelected = info.option("selected");

  bool execute(Given const& given, Args const&, Variable& result) override;
};

bool GetNumModulesCmd::execute(Given const& given, Args const&, Variable& result) {
  GivenOptions const options(given);
  HRuntimeClass const* type = &Module::s_classModule;
  if (options.has(kType)) {
    type = moduleTypeNamed(options.textOr(kType, ""));
    if (!type) return false;
  }
  int count = 0;
  eachModule(options.has(kSelected) ? Among::selected : Among::all,
             [&](Module const& module) { count += module.isKindOf(type); });
  return answer(result, count);
}

}  // namespace

Command* newGetNumModulesCmd() { return new (std::nothrow) GetNumModulesCmd; }
