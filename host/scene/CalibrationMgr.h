// The capture system: the one group above the cameras and the numbers of its devices.
#pragma once

#include "host/base/Types.h"

class Module;

class CalibrationMgr {
 public:
  // The lowest number from 1 that no camera has.
  uint32 getNextAvailableDeviceID() const;
  // Hangs a module under the system group, which is made ("System") when there is none.
  void addToSystemGroup(Module* module);
};
