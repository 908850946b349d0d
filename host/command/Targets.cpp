#include "host/command/Targets.h"

Module* primaryModule(char const* nonePrimary) {
  Module* module = g_db->getPrimarySelectedModule();
  if (!module) Command::logError("%s", nonePrimary);
  return module;
}

bool readOnMod(Given const& given, int onMod, char const* badPath, Module*& module) {
  module = nullptr;
  for (CommandOption const& option : given)
    if (option.getIndex() == onMod && !(module = moduleAt(option.getArg(0).getStringValue(-1), badPath)))
      return false;
  return true;
}

Module* onModOrPrimary(Given const& given, int onMod, char const* badPath, char const* nonePrimary) {
  Module* module = nullptr;
  if (!readOnMod(given, onMod, badPath, module)) return nullptr;
  return module ? module : primaryModule(nonePrimary);
}
