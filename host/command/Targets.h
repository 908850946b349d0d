// Finding what a command works on: modules by path, by "-onMod", or by selection. The database owns them. The
// messages differ from command to command, so the caller gives them.
#pragma once

#include <type_traits>

#include "host/command/ScriptCommand.h"
#include "host/scene/Database.h"

// The most common message for a path that names no module.
inline constexpr char const kNoModuleAt[] = "%s is not a valid unique path to a Module in the scene.";

// The module of a class, or of one derived from it, that a path names. Without one logs `badPath`, whose %s
// is the path, and returns null.
template <class Kind = Module>
Kind* moduleAt(HString const& path, char const* badPath = kNoModuleAt) {
  Module* module = g_db->getModuleWithPath(path, &Kind::staticClass(), false);
  if (!module) Command::logError(badPath, path.GetStr());
  return static_cast<Kind*>(module);
}

// The primary selected module. Without one logs `nonePrimary` and returns null.
Module* primaryModule(char const* nonePrimary);

// The module of the last "-onMod", every one of which must name a module; null when none is given. `onMod` is
// the option's index. False, with a message, for the first path that names no module.
[[nodiscard]] bool readOnMod(Given const& given, int onMod, char const* badPath, Module*& module);
// The same, else the primary selected module. Null, with a message, when there is neither.
Module* onModOrPrimary(Given const& given, int onMod, char const* badPath, char const* nonePrimary);

enum class Among { all, selected };

inline int countModules(Among among) {
  return among == Among::all ? g_db->getNumModules() : g_db->getNumSelectedModules();
}

// Calls work(module) for the selected modules in their order, or for all in order of creation. Work that
// returns a bool ends the walk with false. Returns whether none did.
template <class Work>
bool eachModule(Among among, Work work) {
  // Counted anew each time: the work may change the selection.
  for (int i = 0; i < countModules(among); ++i) {
    Module* module = among == Among::all ? g_db->getModule(i) : g_db->getSelectedModule(i);
    if constexpr (std::is_void_v<decltype(work(*module))>)
      work(*module);
    else if (!work(*module))
      return false;
  }
  return true;
}

// The same for one module alone, or without it (null) for the selected ones.
template <class Work>
bool eachTarget(Module* onMod, Work work) {
  if (!onMod) return eachModule(Among::selected, work);
  if constexpr (std::is_void_v<decltype(work(*onMod))>)
    return work(*onMod), true;
  else
    return work(*onMod);
}
