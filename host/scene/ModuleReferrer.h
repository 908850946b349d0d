// Someone who points at modules and must let go of one that leaves the scene. A module knows its referrers,
// so that removal does not search the scene.
#pragma once

class Module;

class ModuleReferrer {
 public:
  virtual void forget(Module* module) = 0;

 protected:
  ~ModuleReferrer() = default;
  // Each pointer held counts as one reference; null modules are passed over.
  void refer(Module* module);
  void release(Module* module);
  bool refersTo(Module const* module) const;  // constant time
};
