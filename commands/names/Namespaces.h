// What the namespace commands share: which modules they work on.
#pragma once

#include "host/command/Targets.h"

inline constexpr char const kNoSuchModule[] = "%s is not a Module in the scene";

// The module whose namespaces are asked for: that of "-onMod", else the primary selected one. Without one
// logs so and returns null.
inline Module* moduleToRead(Given const& given, int onMod) {
  return onModOrPrimary(given, onMod, kNoSuchModule,
                        "Please select a Module or specify the module with the -onMod option.");
}

// Calls change(module), which returns whether the module took it, for each selected module until one did not.
// kept: a module given by "-onMod" is only looked up, nothing changes.
template <class Change>
bool changeNamespaces(Given const& given, int onMod, Change change) {
  Module* module = nullptr;
  if (!readOnMod(given, onMod, kNoSuchModule, module)) return false;
  if (module) return true;
  if (g_db->getNumSelectedModules() == 0) {
    Command::logError(
        "Please select at least one Module or specify the module to be modified with the -onMod option.");
    return false;
  }
  // kept: a refusal fails without a message.
  return eachModule(Among::selected, change);
}
