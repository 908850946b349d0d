// What the namespace commands share: which modules they work on.
#pragma once

#include "commands/Targets.h"
#include "host/command/ScriptCommand.h"
#include "host/scene/Database.h"

// The modules of all "-onMod" options, of which the last is meant; null when none is given. False, with a
// message, for the first path that names no module.
[[nodiscard]] inline bool readOnMod(Given const& given, int onMod, Module*& module) {
  module = nullptr;
  for (CommandOption const& option : given) {
    if (option.getIndex() != onMod) continue;
    module = moduleAt(option.getArg(0).getStringValue(-1), "%s is not a Module in the scene");
    if (!module) return false;
  }
  return true;
}

// The module whose namespaces are asked for: that of "-onMod", else the primary selected one. Without one
// logs so and returns null.
inline Module* moduleToRead(Given const& given, int onMod) {
  Module* module = nullptr;
  if (!readOnMod(given, onMod, module)) return nullptr;
  if (!module) module = g_db->getPrimarySelectedModule();
  if (!module) Command::logError("Please select a Module or specify the module with the -onMod option.");
  return module;
}

// Calls change(module), which returns whether the module took it, for each selected module until one did not.
// kept: a module given by "-onMod" is only looked up, nothing changes.
template <class Change>
bool changeNamespaces(Given const& given, int onMod, Change change) {
  Module* module = nullptr;
  if (!readOnMod(given, onMod, module)) return false;
  if (module) return true;
  if (g_db->getNumSelectedModules() == 0) {
    Command::logError(
        "Please select at least one Module or specify the module to be modified with the -onMod option.");
    return false;
  }
  // kept: a refusal fails without a message.
  for (int i = 0; i < g_db->getNumSelectedModules(); ++i)
    if (!change(*g_db->getSelectedModule(i))) return false;
  return true;
}
