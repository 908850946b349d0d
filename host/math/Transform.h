// A position, an orientation and a scale, in some space. Lengths are millimetres.
#pragma once

#include "host/math/TalixRotation.h"

struct Transform {
  Vec3 position;
  TalixRotation rotation;
  Vec3 scale{1, 1, 1};

  bool operator==(Transform const&) const = default;
  // What is given in this transform's space, in the space that this one is given in. Transforms do not shear,
  // so with uneven scales a product must begin at the root.
  Transform operator*(Transform const& inner) const;
  // The same transform seen from `space`, which is given beside it. Along an axis of scale 0 everything is at
  // 0.
  Transform relativeTo(Transform const& space) const;
};

Vec3 positionRelativeTo(Transform const& space, Vec3 const& position);
// Component by component; 0 where the divisor is 0.
Vec3 quotients(Vec3 const& a, Vec3 const& b);
