// Vectors and rotations as the raw values that keys hold.
#pragma once

#include "host/scene/Controller.h"

inline Controller::Values rawValues(Vec3 const& v) { return {v.x, v.y, v.z}; }

inline Controller::Values rawValues(TalixRotation const& rotation) {
  Controller::Values values;
  rotation.getQuaternion(values.data());
  return values;
}

inline TalixRotation rotationOf(Controller::Values const& values) {
  TalixRotation rotation;
  rotation.setQuaternion(values.data());
  return rotation;
}
