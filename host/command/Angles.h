// Rotations at the border of scripts: degrees outside, radians inside.
#pragma once

#include "host/math/Degrees.h"
#include "host/math/TalixRotation.h"
#include "host/scene/Node.h"

inline constexpr double kRadiansPerDegree = 1 / kDegreesPerRadian;

inline Vec3 eulerDegrees(TalixRotation const& rotation, TalixRotation::RotOrder order) {
  Vec3 angles;
  rotation.getAsEuler(order, angles);
  return angles * kDegreesPerRadian;
}

inline TalixRotation rotationFromDegrees(Vec3 const& degrees, TalixRotation::RotOrder order) {
  TalixRotation rotation;
  rotation.setAsEuler(order, degrees * kRadiansPerDegree);
  return rotation;
}
