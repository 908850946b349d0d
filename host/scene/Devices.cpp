#include "host/scene/Devices.h"

H_DEFINE_CLASS(OpticalCamera);
H_DEFINE_CLASS(AnalogDevice);
H_DEFINE_SINGLE_CLASS(SystemGroup);

void OpticalCamera::setUp() {
  Node::setUp();
  addChannel("FocalLength", DataSource::FloatProperty);
  addChannel("Threshold", DataSource::IntProperty);
  m_deviceID = addBuiltIn<IntAttribute>("DeviceID");
  addBuiltIn<TemperatureAttribute>("Temperature");
  addBuiltIn<MatrixAttribute>("Intrinsics");
  setReaction(addBuiltIn<EventAttribute>("Reset"), [](Module& module, Attribute&) {
    for (char const* name : {"FocalLength", "Threshold"}) module.getChannel(name)->setDefaultValues({});
  });
}

void OpticalCamera::setDeviceID(uint32 id) {
  m_deviceID->setValue(static_cast<int>(id), true, true, true, true);
}
