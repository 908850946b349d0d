// The capture system: the one group above the cameras and the numbers of its devices.
#pragma once

#include <unordered_set>

#include "host/base/ControlID.h"

class Database;
class Module;

class CalibrationMgr {
 public:
  explicit CalibrationMgr(Database& scene) : m_scene(scene) {}

  // The lowest number from 1 that no camera has. Looks at all modules: FreeDeviceNumbers serves many cameras.
  uint32 getNextAvailableDeviceID() const;
  // Hangs a module under the system group, which is made ("System") when there is none, with a name that its
  // siblings do not have there.
  void addToSystemGroup(Module* module);

 private:
  Module* findSystemGroup();

  Database& m_scene;
  ControlID m_systemGroup{ControlID::CreateBlank};  // as last seen
};

// Hands out the numbers that no camera of the scene had when this was made, lowest first, each once.
class FreeDeviceNumbers {
 public:
  explicit FreeDeviceNumbers(Database const& scene);
  uint32 take();

 private:
  std::unordered_set<uint32> m_taken;
  uint32 m_next = 1;
};
