#include "host/math/TalixRotation.h"

#include <ImathQuat.h>
#include <ImathVec.h>
#include <algorithm>
#include <cmath>
#include <numbers>

namespace {

using Quat = Imath::Quatd;

// The axes of each order, first applied first.
constexpr int kAxes[6][3] = {{0, 1, 2}, {0, 2, 1}, {1, 0, 2}, {1, 2, 0}, {2, 0, 1}, {2, 1, 0}};

// +1 when the axes of the order follow each other as x, y, z do.
constexpr double parity(int const (&axes)[3]) { return (axes[1] - axes[0] + 3) % 3 == 1 ? 1.0 : -1.0; }

Quat aboutAxis(int axis, double angle) {
  Imath::V3d v(0);
  v[axis] = std::sin(angle / 2);
  return Quat(std::cos(angle / 2), v);
}

void set(TalixRotation& rotation, Quat const& q) {
  double const xyzw[4] = {q.v.x, q.v.y, q.v.z, q.r};
  rotation.setQuaternion(xyzw);
}

// Never -0.
double withinHalfTurn(double angle) { return std::remainder(angle, 2 * std::numbers::pi) + 0.0; }

}  // namespace

TalixRotation& TalixRotation::operator*=(TalixRotation const& o) {
  set(*this, Quat(m_w, m_x, m_y, m_z) * Quat(o.m_w, o.m_x, o.m_y, o.m_z));
  return *this;
}

TalixRotation TalixRotation::inverse() const {
  TalixRotation result = *this;
  result.m_x = -m_x, result.m_y = -m_y, result.m_z = -m_z;
  return result;
}

Vec3 TalixRotation::rotate(Vec3 const& v) const {
  Vec3 const axis(m_x, m_y, m_z);
  Vec3 const t = axis.cross(v) * 2.0;
  return v + t * m_w + axis.cross(t);
}

void TalixRotation::setAsEuler(RotOrder order, Vec3 const& angles) {
  auto const& axes = kAxes[order];
  set(*this, aboutAxis(axes[2], angles[axes[2]]) * aboutAxis(axes[1], angles[axes[1]]) *
                 aboutAxis(axes[0], angles[axes[0]]));
}

void TalixRotation::getAsEuler(RotOrder order, Vec3& angles) const {
  // R = R_k(c) R_j(b) R_i(a) for the order i, j, k. With s the order's parity, the entries that name one or
  // two angles are R[k][i] = -s sin b, R[k][j] / R[k][k] = s tan a. Near gimbal lock these two shrink and a
  // loses digits, so c is what remains once this very a is undone: R R_i(-a) takes axis j to where R_k(c)
  // does, and the three angles together stay exact.
  auto const& [i, j, k] = kAxes[order];
  double const s = parity(kAxes[order]);
  Vec3 columns[3];
  for (int axis = 0; axis < 3; ++axis) {
    Vec3 unit;
    unit[axis] = 1;
    columns[axis] = rotate(unit);
  }
  auto const entry = [&](int row, int column) { return columns[column][row]; };
  double const cosB = std::hypot(entry(i, i), entry(j, i));
  angles[j] = std::atan2(-s * entry(k, i), cosB);
  if (cosB > 1e-9) {
    angles[i] = std::atan2(s * entry(k, j), entry(k, k));
    Vec3 const turned = columns[j] * std::cos(angles[i]) + columns[k] * (-s * std::sin(angles[i]));
    angles[k] = std::atan2(-s * turned[i], turned[j]);
  } else {
    angles[i] = std::atan2(-s * entry(j, k), entry(j, j));
    angles[k] = 0;
  }
  for (int axis = 0; axis < 3; ++axis) angles[axis] += 0.0;  // no angle is -0
}

void TalixRotation::setAsVector(Vec3 rotationVector) {
  double const angle = rotationVector.length();
  // sin(angle / 2) / angle, by its series where the quotient loses digits.
  double const factor = angle < 1e-4 ? 0.5 - angle * angle / 48 : std::sin(angle / 2) / angle;
  double const xyzw[4] = {rotationVector.x * factor, rotationVector.y * factor, rotationVector.z * factor,
                          std::cos(angle / 2)};
  setQuaternion(xyzw);
}

void TalixRotation::getAsVector(Vec3& rotationVector) const {
  double const sign = m_w < 0 ? -1 : 1;
  Vec3 const axis(m_x * sign, m_y * sign, m_z * sign);
  double const sine = axis.length();
  double const angle = 2 * std::atan2(sine, m_w * sign);
  rotationVector = axis * (sine < 1e-9 ? 2.0 : angle / sine);
}

void TalixRotation::setAsHardySpicerRotation(double major, double minor, int majorAxis, int minorAxis,
                                             TalixRotation) {
  set(*this, aboutAxis(majorAxis, major) * aboutAxis(minorAxis, minor));
}

void TalixRotation::getAsHardySpicerRotation(double& major, double& minor, int majorAxis,
                                             int minorAxis) const {
  if (majorAxis == minorAxis) {
    major = getAsHingeRotation(majorAxis);
    minor = 0;
    return;
  }
  // With half angles A and B about axes i and j, and e_i e_j = s e_k, the joint's quaternion is
  // (cos A cos B, e_i sin A cos B, e_j cos A sin B, e_k s sin A sin B). Its dot product with (w, x, y, z),
  // written along i, j, k, is a sum of a wave in A + B and one in A - B, each of which is greatest where its
  // own angle is that of its coefficients.
  double const along[3] = {m_x, m_y, m_z};
  double const x = along[majorAxis], y = along[minorAxis];
  double const z = along[3 - majorAxis - minorAxis] * ((minorAxis - majorAxis + 3) % 3 == 1 ? 1 : -1);
  double const sum = std::atan2(x + y, m_w - z), difference = std::atan2(x - y, m_w + z);
  major = withinHalfTurn(sum + difference);
  minor = withinHalfTurn(sum - difference);
}

void TalixRotation::setAsHingeRotation(double angle, int axis) { set(*this, aboutAxis(axis, angle)); }

double TalixRotation::getAsHingeRotation(int axis) const {
  double const along[3] = {m_x, m_y, m_z};
  return withinHalfTurn(2 * std::atan2(along[axis], m_w));
}

void TalixRotation::setQuaternion(double const* xyzw) {
  double const length =
      std::sqrt(xyzw[0] * xyzw[0] + xyzw[1] * xyzw[1] + xyzw[2] * xyzw[2] + xyzw[3] * xyzw[3]);
  if (!(length > 0) || !std::isfinite(length)) return makeIdentity();
  // A quaternion that is of unit length to the last digits is kept as it is, so that what was stored reads
  // back.
  double const scale = std::abs(length - 1) < 1e-15 ? 1 : 1 / length;
  m_x = xyzw[0] * scale, m_y = xyzw[1] * scale, m_z = xyzw[2] * scale, m_w = xyzw[3] * scale;
}

void TalixRotation::getQuaternion(double* xyzw) const {
  xyzw[0] = m_x, xyzw[1] = m_y, xyzw[2] = m_z, xyzw[3] = m_w;
}

TalixRotation TalixRotation::slerp(TalixRotation const& a, TalixRotation const& b, double part) {
  TalixRotation result;
  set(result,
      Imath::slerpShortestArc(Quat(a.m_w, a.m_x, a.m_y, a.m_z), Quat(b.m_w, b.m_x, b.m_y, b.m_z), part));
  return result;
}

double unrolled(double angle, double near) {
  constexpr double turn = 2 * std::numbers::pi;
  return angle + std::round((near - angle) / turn) * turn;
}

Vec3 unrolledEuler(TalixRotation::RotOrder order, Vec3 const& angles, Vec3 const& near) {
  auto const& [i, j, k] = kAxes[order];
  Vec3 other;  // the second solution turns the outer axes by half a turn and mirrors the middle angle
  other[i] = angles[i] + std::numbers::pi;
  other[j] = std::numbers::pi - angles[j];
  other[k] = angles[k] + std::numbers::pi;
  Vec3 best, second;
  double bestWay = 0, secondWay = 0;
  for (int axis = 0; axis < 3; ++axis) {
    best[axis] = unrolled(angles[axis], near[axis]);
    second[axis] = unrolled(other[axis], near[axis]);
    bestWay += std::abs(best[axis] - near[axis]);
    secondWay += std::abs(second[axis] - near[axis]);
  }
  return secondWay < bestWay ? second : best;
}
