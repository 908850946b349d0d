#include "commands/objects/SceneQueries.h"

HRuntimeClass const* moduleTypeNamed(HString const& name) {
  HRuntimeClass const* type = HRuntimeClass::findClass(name.GetStr());
  if (type && type->isDerivedFrom(&Module::s_classModule)) return type;
  Command::logError("\"%s\" is not a Module type name", name.GetStr());
  return nullptr;
}

Variable pathsOf(std::vector<Module*> const& modules, Module::EPathType type) {
  Variable paths(Variable::StringArray, static_cast<int>(modules.size()));
  for (size_t i = 0; i < modules.size(); ++i)
    paths.setValue(modules[i]->getPath(type).GetStr(), static_cast<int>(i));
  return paths;
}
