// The value between two keys: what evaluation and reduction share.
#pragma once

#include <ImathQuat.h>

#include "host/keys/KeyTrack.h"

namespace interpolation {

// The slope at the key between two intervals, of the parabola through its three keys, times the length of one
// interval: weights for the differences over that interval and over the other one.
struct Tangent {
  double own = 1, other = 0;  // one-sided

  Tangent() = default;
  Tangent(double ownLength, double otherLength)
      : own(otherLength / (ownLength + otherLength)),
        other(ownLength * ownLength / (otherLength * (ownLength + otherLength))) {}

  template <class T>
  T operator()(T const& ownDifference, T const& otherDifference) const {
    return ownDifference * own + otherDifference * other;
  }
};

inline double hermite(double u, double p0, double m0, double p1, double m1) {
  const double d = p1 - p0;
  return p0 + u * (m0 + u * ((3 * d - 2 * m0 - m1) + u * (m0 + m1 - 2 * d)));
}

using Quat = Imath::Quatd;
using V3 = Imath::V3d;

// The rotation from a to b as axis times half the angle, and back.
inline V3 logBetween(Quat const& a, Quat const& b) { return (~a * b).log().v; }
inline Quat turned(Quat const& q, V3 const& by) { return q * Quat(0, by).exp(); }

inline Quat nearest(Quat const& q, Quat const& to) { return (q ^ to) < 0 ? -q : q; }

inline Quat squad(double u, Tangent const& leaving, Tangent const& arriving, Quat const& before,
                  Quat const& a, Quat const& b, Quat const& after) {
  const V3 forth = logBetween(a, b), back = -logBetween(b, a);
  const V3 start = leaving(forth, -logBetween(a, nearest(before, a)));
  const V3 end = arriving(back, logBetween(b, nearest(after, b)));
  const Quat nearA = turned(a, (start - forth) * 0.5), nearB = turned(b, (back - end) * 0.5);
  return Imath::slerp(Imath::slerp(a, b, u), Imath::slerp(nearA, nearB, u), 2 * u * (1 - u));
}

}  // namespace interpolation

// The value at a time between the keys a and b, which lie before and behind it, for Linear and Cubic. Cubic
// also looks at the neighbours, which may be none. Point has time(), value(component) and a test for none.
// Components that are not wanted(component) stay as they are; rotations are whole.
template <class Point, class Wanted>
void interpolateKeys(KeyTrack::Shape shape, Interpolation kind, int64 time, Point before, Point const& a,
                     Point const& b, Point after, Wanted wanted, KeyTrack::Values& values) {
  using namespace interpolation;
  const auto length = static_cast<double>(b.time() - a.time());
  const double u = static_cast<double>(time - a.time()) / length;
  Tangent leaving, arriving;
  if (kind == Interpolation::Cubic) {
    if (before) leaving = {length, static_cast<double>(a.time() - before.time())};
    if (after) arriving = {length, static_cast<double>(after.time() - b.time())};
    if (!before) before = a;
    if (!after) after = b;
  }

  if (shape == KeyTrack::Shape::Rotation) {
    const auto quatAt = [](Point const& key) {
      return Quat(key.value(3), key.value(0), key.value(1), key.value(2));
    };
    const Quat qa = quatAt(a), qb = nearest(quatAt(b), qa);
    const Quat q = kind == Interpolation::Linear
                       ? Imath::slerp(qa, qb, u)
                       : squad(u, leaving, arriving, quatAt(before), qa, qb, quatAt(after));
    values = {q.v.x, q.v.y, q.v.z, q.r};
    return;
  }
  for (int c = 0; c < static_cast<int>(shape); ++c) {
    if (!wanted(c)) continue;
    const double pa = a.value(c), pb = b.value(c), d = pb - pa;
    double& out = values[static_cast<size_t>(c)];
    if (kind == Interpolation::Linear) {
      out = pa + d * u;
    } else {
      out = hermite(u, pa, leaving(d, pa - before.value(c)), pb, arriving(d, after.value(c) - pb));
    }
  }
}
