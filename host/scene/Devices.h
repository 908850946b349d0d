// Cameras, analog devices and the group that holds the capture system.
#pragma once

#include "host/scene/Node.h"

class OpticalCamera : public Node {
  H_DECLARE_CLASS(OpticalCamera, Node)

 public:
  int getDeviceID() const { return m_deviceID->getValue(); }
  void setDeviceID(uint32 id);

 protected:
  void setUp() override;

 private:
  IntAttribute* m_deviceID = nullptr;
};

// Channels that were sampled beside the markers, and values computed with a take.
class AnalogDevice : public Module {
  H_DECLARE_CLASS(AnalogDevice, Module)
};

// The one module above the cameras: "System".
class SystemGroup : public Module {
  H_DECLARE_CLASS(SystemGroup, Module)
};
