// A path to a module that can be shortened from its end.
#pragma once

#include "host/scene/Module.h"

class ModulePath {
 public:
  ModulePath() = default;
  explicit ModulePath(Module const* module) { setFromObject(module); }
  ~ModulePath() = default;

  // From the root to the module; null gives the empty path.
  void setFromObject(Module const* module);
  // Takes the last module off and returns it; null when the path is empty.
  Module* pop();
  // The names from the root, each after a backslash; empty for the empty path.
  HString getFullPathString() const;

 private:
  Module* m_last = nullptr;
};
