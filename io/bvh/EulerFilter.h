// Turns the quaternions of successive frames into Euler angles that run on without jumps.
#pragma once

#include "host/math/TalixRotation.h"
#include "host/math/Vec3.h"

namespace talix {

class EulerFilter {
 public:
  // Rotation orders 0 to 5. Where not all three angles can be kept, the middle one must stay within a quarter
  // turn, so that one which is 0 stays 0.
  EulerFilter(int order, bool keepsAll) : m_order(order), m_keepsAll(keepsAll) {}

  // The angles in radians, by axis, that make the rotation and lie nearest to those of the frame before;
  // before the first frame these are 0.
  Vec3 next(double const* quaternion);

 private:
  void keepFirstAngle(TalixRotation const&, Vec3& angles) const;

  int m_order;
  bool m_keepsAll;
  Vec3 m_last;
};

}  // namespace talix
