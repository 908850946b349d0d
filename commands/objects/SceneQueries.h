// What the scene queries share: forms of path, types by name, walks over the modules.
#pragma once

#include <vector>

#include "host/command/ScriptCommand.h"
#include "host/scene/Database.h"

// The form of path that is asked for: the later of "-fullPath" and "-nameOnly" on the line, else the
// shortest.
template <class Query>
Module::EPathType pathType(Given const& given) {
  Module::EPathType type = Module::ShortestPath;
  for (CommandOption const& option : given) {
    if (option.getIndex() == Query::info.option("fullPath")) type = Module::FullPath;
    if (option.getIndex() == Query::info.option("nameOnly")) type = Module::NameOnly;
  }
  return type;
}

// The module class of that name. Without one logs so and returns null.
HRuntimeClass const* moduleTypeNamed(HString const& name);

// Calls visit(module) for the selected modules in their order, or for all in order of creation.
template <class Visit>
void eachModule(bool selected, Visit visit) {
  if (selected)
    for (int i = 0; i < g_db->getNumSelectedModules(); ++i) visit(g_db->getSelectedModule(i));
  else
    for (int i = 0; i < g_db->getNumModules(); ++i) visit(g_db->getModule(i));
}

// Their paths, as a string array.
Variable pathsOf(std::vector<Module*> const& modules, Module::EPathType type);
