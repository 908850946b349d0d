#include "commands/properties/PropertyReading.h"
#include "host/command/Results.h"

namespace {

class GetStringArrayPropertyCmd final : public ScriptCommand<GetStringArrayPropertyCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getStringArrayProperty",
      .displayName = "Get HString Array Property",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose = "Reads a list of modules that a module refers to, as their shortest paths.",
      .example = "getStringArrayProperty Cluster Markers",
      .args = {"moduleName propertyName", 2, 2, {Variable::String, Variable::String}},
      .argsText = "moduleName is a path, propertyName an attribute that lists modules, in exact case.",
      .returns = Variable::StringArray,
      .solo = Solo::no};

  bool execute(Given const&, Args const& args, Variable& result) override;
};

bool GetStringArrayPropertyCmd::execute(Given const&, Args const& args, Variable& result) {
  Attribute const* attribute = attributeAt(args);
  if (!attribute) return false;
  MultiModAttribute const* modules = objectAs<MultiModAttribute>(attribute);
  if (!modules) return redirect(Getter::StringArray, *attribute);
  Variable paths(Variable::StringArray, modules->getNumModules());
  for (int i = 0; i < modules->getNumModules(); ++i)
    if (Module const* module = modules->getModuleValue(i))  // else an empty text
      paths.setValue(module->getMinimumPathString(false).GetStr(), i);
  return answer(result, paths);
}

}  // namespace

Command* newGetStringArrayPropertyCmd() { return new (std::nothrow) GetStringArrayPropertyCmd; }
