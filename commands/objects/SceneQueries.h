// What the scene queries share: forms of path, types by name.
#pragma once

#include <vector>

#include "host/command/Targets.h"

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

// Their paths, as a string array.
Variable pathsOf(std::vector<Module*> const& modules, Module::EPathType type);
