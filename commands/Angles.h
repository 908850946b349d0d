// Rotations at the script's border: degrees outside, radians inside.
#pragma once

#include "host/math/TalixRotation.h"
#include "host/scene/Node.h"

inline constexpr double kDegreesPerRadian = 57.29577951308232;

// The order in which a module's angles are counted; XYZ for one that is no node.
inline TalixRotation::RotOrder rotationOrderOf(Module const& module) {
  Node const* node = objectAs<Node>(&module);
  return node ? node->getRotationOrder() : TalixRotation::XYZ;
}

inline Vec3 eulerDegrees(TalixRotation const& rotation, TalixRotation::RotOrder order) {
  Vec3 angles;
  rotation.getAsEuler(order, angles);
  return angles * kDegreesPerRadian;
}
