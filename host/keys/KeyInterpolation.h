// The value between two keys: what evaluation, sampling and reduction share.
#pragma once

#include <ImathQuat.h>

#include "host/keys/KeyTrack.h"

namespace interpolation {

// The slope at the key between two intervals, of the parabola through its three keys, times the length of one
// interval: weights for the differences over that interval and over the other one.
struct Tangent {
  double own, other;

  static Tangent oneSided() { return {1, 0}; }
  static Tangent between(double ownLength, double otherLength) {
    double const both = ownLength + otherLength;
    return {otherLength / both, ownLength * ownLength / (otherLength * both)};
  }

  template <class T>
  T operator()(T const& ownDifference, T const& otherDifference) const {
    return ownDifference * own + otherDifference * other;
  }
};

// The cubic between two values with the slopes m0 and m1, u from 0 to 1.
class CubicSpan {
 public:
  CubicSpan() = default;
  CubicSpan(double p0, double m0, double p1, double m1) : m_value(p0), m_slope(m0) {
    double const d = p1 - p0;
    m_square = 3 * d - 2 * m0 - m1;
    m_cube = m0 + m1 - 2 * d;
  }
  double start() const { return m_value; }
  double at(double u) const { return m_value + u * (m_slope + u * (m_square + u * m_cube)); }

 private:
  double m_value, m_slope, m_square, m_cube;
};

using Quat = Imath::Quatd;
using V3 = Imath::V3d;

// The rotation from a to b as axis times half the angle, and back.
inline V3 logBetween(Quat const& a, Quat const& b) { return (~a * b).log().v; }
inline Quat turned(Quat const& q, V3 const& by) { return q * Quat(0, by).exp(); }

inline Quat nearest(Quat const& q, Quat const& to) { return (q ^ to) < 0 ? -q : q; }

// The arc between two unit quaternions: Imath::slerp, with what is the same for every u calculated once.
class Arc {
 public:
  Arc() = default;
  Arc(Quat const& a, Quat const& b)
      : m_a(a), m_b(b), m_angle(Imath::angle4D(a, b)), m_sinc(Imath::sinx_over_x(m_angle)) {}
  Quat at(double u) const {
    double const s = 1 - u;
    return (Imath::sinx_over_x(s * m_angle) / m_sinc * s * m_a +
            Imath::sinx_over_x(u * m_angle) / m_sinc * u * m_b)
        .normalized();
  }

 private:
  Quat m_a, m_b;
  double m_angle = 0, m_sinc = 1;
};

class SquadSpan {
 public:
  SquadSpan() = default;
  SquadSpan(Tangent const& leaving, Tangent const& arriving, Quat const& before, Quat const& a, Quat const& b,
            Quat const& after)
      : m_arc(a, b) {
    V3 const forth = logBetween(a, b), back = -logBetween(b, a);
    V3 const start = leaving(forth, -logBetween(a, nearest(before, a)));
    V3 const end = arriving(back, logBetween(b, nearest(after, b)));
    m_near = Arc(turned(a, (start - forth) * 0.5), turned(b, (back - end) * 0.5));
  }
  Quat at(double u) const { return Arc(m_arc.at(u), m_near.at(u)).at(2 * u * (1 - u)); }

 private:
  Arc m_arc, m_near;
};

}  // namespace interpolation

// The value at a time between the keys a and b, which lie before and after it, for Linear and Cubic. Cubic
// also looks at the neighbours, which may be none. Point has time(), value(component) and a test for none.
// Components that are not wanted(component) stay as they are; rotations are whole.
template <class Point, class Wanted>
void interpolateKeys(KeyTrack::Shape shape, Interpolation kind, int64 time, Point before, Point const& a,
                     Point const& b, Point after, Wanted wanted, KeyTrack::Values& values) {
  using namespace interpolation;
  int64 const start = a.time(), end = b.time();
  auto const length = static_cast<double>(end - start);
  double const u = static_cast<double>(time - start) / length;
  Tangent leaving = Tangent::oneSided(), arriving = leaving;
  if (kind == Interpolation::Cubic) {
    if (before) leaving = Tangent::between(length, static_cast<double>(start - before.time()));
    if (after) arriving = Tangent::between(length, static_cast<double>(after.time() - end));
    if (!before) before = a;
    if (!after) after = b;
  }

  if (shape == KeyTrack::Shape::Rotation) {
    auto const quatAt = [](Point const& key) {
      return Quat(key.value(3), key.value(0), key.value(1), key.value(2));
    };
    Quat const qa = quatAt(a), qb = nearest(quatAt(b), qa);
    Quat const q = kind == Interpolation::Linear
                       ? Arc(qa, qb).at(u)
                       : SquadSpan(leaving, arriving, quatAt(before), qa, qb, quatAt(after)).at(u);
    values = {q.v.x, q.v.y, q.v.z, q.r};
    return;
  }
  for (int c = 0; c < static_cast<int>(shape); ++c) {
    if (!wanted(c)) continue;
    double const pa = a.value(c), pb = b.value(c), d = pb - pa;
    double& out = values[static_cast<size_t>(c)];
    if (kind == Interpolation::Linear) {
      out = pa + d * u;
    } else {
      out = CubicSpan(pa, leaving(d, pa - before.value(c)), pb, arriving(d, after.value(c) - pb)).at(u);
    }
  }
}
