#include "io/bvh/EulerUnroller.h"

#include <cmath>
#include <numbers>

#include "io/bvh/BvhChannels.h"

namespace talix {

namespace {

constexpr double kPi = std::numbers::pi;

// Below this cosine of the middle angle the outer two turn about one line, and only their sum is known.
constexpr double kGimbalLock = 3e-8;

Vec3 turnedBy(const double* q, const Vec3& v) {
  const Vec3 axis(q);
  return v + axis.cross(axis.cross(v) + v * q[3]) * 2;
}

Vec3 unit(int axis) {
  Vec3 v;
  v[axis] = 1;
  return v;
}

// Adds whole turns so that each angle is nearest to the one before.
Vec3 unwound(Vec3 angles, const Vec3& before) {
  for (int axis = 0; axis < 3; ++axis)
    angles[axis] += 2 * kPi * std::round((before[axis] - angles[axis]) / (2 * kPi));
  return angles;
}

double distance(const Vec3& a, const Vec3& b) {
  return std::abs(a.x - b.x) + std::abs(a.y - b.y) + std::abs(a.z - b.z);
}

}  // namespace

Vec3 EulerUnroller::next(const double* quaternion) {
  const auto& axes = kOrderAxes[m_order];
  Vec3 angles;
  TalixRotation rotation;
  rotation.setQuaternion(quaternion);
  rotation.getAsEuler(static_cast<TalixRotation::RotOrder>(m_order), angles);
  if (std::abs(std::cos(angles[axes[1]])) < kGimbalLock) keepFirstAngle(quaternion, angles);

  // The same rotation with the middle angle on the other side of a quarter turn.
  Vec3 other = angles;
  other[axes[0]] += kPi;
  other[axes[1]] = kPi - other[axes[1]];
  other[axes[2]] += kPi;

  angles = unwound(angles, m_last);
  other = unwound(other, m_last);
  m_last = m_keepsAll && distance(other, m_last) < distance(angles, m_last) ? other : angles;
  return m_last;
}

// In gimbal lock the first angle is free: it stays as it was, and the last one makes up the rotation. It
// shows in where the middle axis goes once the first turn is taken back.
void EulerUnroller::keepFirstAngle(const double* quaternion, Vec3& angles) const {
  const auto [first, middle, last] = kOrderAxes[m_order];
  const double parity = unit(first).cross(unit(middle)).dot(unit(last));
  angles[first] = m_last[first];
  const Vec3 back = unit(middle) * std::cos(angles[first]) - unit(last) * (parity * std::sin(angles[first]));
  const Vec3 image = turnedBy(quaternion, back);
  angles[last] = std::atan2(-parity * image[first], image[middle]);
}

}  // namespace talix
