#include "io/bvh/EulerFilter.h"

#include <cmath>

#include "io/bvh/BvhChannels.h"

namespace talix {

namespace {

// Below this cosine of the middle angle the outer two turn about one line, and only their sum is known.
constexpr double kGimbalLock = 1e-8;

Vec3 unit(int axis) {
  Vec3 v;
  v[axis] = 1;
  return v;
}

}  // namespace

Vec3 EulerFilter::next(double const* quaternion) {
  auto const order = static_cast<TalixRotation::RotOrder>(m_order);
  TalixRotation rotation;
  rotation.setQuaternion(quaternion);
  Vec3 angles;
  rotation.getAsEuler(order, angles);
  if (std::abs(std::cos(angles[kOrderAxes[m_order][1]])) < kGimbalLock) keepFirstAngle(rotation, angles);
  if (m_keepsAll) return m_last = unrolledEuler(order, angles, m_last);
  for (int axis = 0; axis < 3; ++axis) m_last[axis] = unrolled(angles[axis], m_last[axis]);
  return m_last;
}

// In gimbal lock the first angle is free: it stays as it was, and the last one makes up the rotation. It
// shows in where the middle axis goes once the first turn is taken back.
void EulerFilter::keepFirstAngle(TalixRotation const& rotation, Vec3& angles) const {
  auto const [first, middle, last] = kOrderAxes[m_order];
  double const parity = unit(first).cross(unit(middle)).dot(unit(last));
  angles[first] = m_last[first];
  Vec3 const back = unit(middle) * std::cos(angles[first]) - unit(last) * (parity * std::sin(angles[first]));
  Vec3 const image = rotation.rotate(back);
  angles[last] = std::atan2(-parity * image[first], image[middle]);
}

}  // namespace talix
