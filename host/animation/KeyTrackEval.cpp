// Evaluation of the key track between its keys.
#include <ImathQuat.h>
#include <cmath>

#include "host/animation/KeyTrackPlace.h"

namespace {

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

double hermite(double u, double p0, double m0, double p1, double m1) {
  const double d = p1 - p0;
  return p0 + u * (m0 + u * ((3 * d - 2 * m0 - m1) + u * (m0 + m1 - 2 * d)));
}

using Quat = Imath::Quatd;
using V3 = Imath::V3d;

// The rotation from a to b as axis times half the angle, and back.
V3 logBetween(Quat const& a, Quat const& b) { return (~a * b).log().v; }
Quat turned(Quat const& q, V3 const& by) { return q * Quat(0, by).exp(); }

Quat nearest(Quat const& q, Quat const& to) { return (q ^ to) < 0 ? -q : q; }

Quat squad(double u, Tangent const& leaving, Tangent const& arriving, Quat const& before, Quat const& a,
           Quat const& b, Quat const& after) {
  const V3 forth = logBetween(a, b), back = -logBetween(b, a);
  const V3 start = leaving(forth, -logBetween(a, nearest(before, a)));
  const V3 end = arriving(back, logBetween(b, nearest(after, b)));
  const Quat nearA = turned(a, (start - forth) * 0.5), nearB = turned(b, (back - end) * 0.5);
  return Imath::slerp(Imath::slerp(a, b, u), Imath::slerp(nearA, nearB, u), 2 * u * (1 - u));
}

}  // namespace

// As placeAtOrBefore(time), with the search spared while the time stays in the cursor's leaf or enters the
// next.
KeyTrack::Place KeyTrack::placeAtOrBefore(int64 time, Cursor& cursor) const {
  if (!m_root) return {};
  const auto leafAt = [this](int64 index) { return placeAt(index).leaf; };
  const bool known = cursor.leaf && cursor.version == m_version && time >= cursor.leaf->firstTime();
  if (known && cursor.next && time >= cursor.next->firstTime()) {
    cursor.firstIndex += cursor.leaf->size();
    cursor.leaf = cursor.next;
    cursor.next = leafAt(cursor.firstIndex + cursor.leaf->size());
    cursor.slot = 0;
  }
  if (!known || (cursor.next && time >= cursor.next->firstTime())) {
    const Place place = placeAtOrBefore(time);
    if (!place) return place;
    const int64 first = place.index - place.slot;
    cursor = {place.leaf, leafAt(first + place.leaf->size()), first, place.slot, m_version};
    return place;
  }
  cursor.slot = cursor.leaf->lastAtOrBefore(time, cursor.slot);
  return {cursor.leaf, cursor.firstIndex + cursor.slot, cursor.slot};
}

// The next (step 1) or previous (step -1) key that holds a component of the mask.
KeyTrack::Place KeyTrack::neighbour(Place const& from, int step, unsigned mask, Cursor const* cursor) const {
  KeyLeaf const& leaf = *from.leaf;
  const int slot = step > 0 ? (from.slot + 1 < leaf.size() ? leaf.nextHolding(from.slot + 1, mask) : -1)
                            : leaf.previousHolding(from.slot - 1, mask);
  if (slot >= 0) return {&leaf, from.index + slot - from.slot, slot};
  if (step > 0 && cursor && cursor->leaf == &leaf) {
    if (!cursor->next) return {};
    const int ahead = cursor->next->nextHolding(0, mask);
    if (ahead >= 0) return {cursor->next, cursor->firstIndex + leaf.size() + ahead, ahead};
  }
  const int64 index = step > 0 ? nextHolding(from.index, mask) : previousHolding(from.index, mask);
  return index < 0 ? Place() : placeAt(index);
}

void KeyTrack::evaluateAt(int64 time, Interpolation interpolation, unsigned mask, Place const& base,
                          Values const& defaults, Values& values, Cursor const* cursor) const {
  const bool split = m_shape == Shape::Vector && mask != kAll;
  const auto wanted = [&](int c) { return !split || (mask >> c & 1); };
  const auto hold = [&](Place const& key) {
    for (int c = 0; c < width(); ++c)
      if (wanted(c)) values[static_cast<size_t>(c)] = key ? key.value(c) : defaults[static_cast<size_t>(c)];
  };

  // The keys around the time: a at or before it, b behind it.
  Place a = base;
  if (a && !(a.leaf->components(a.slot) & mask)) a = neighbour(a, -1, mask, cursor);
  if (!a) {
    const int64 first = nextHolding(-1, mask);
    return hold(first < 0 ? Place() : placeAt(first));
  }
  if (interpolation == Interpolation::Constant || a.time() == time) return hold(a);
  const Place b = neighbour(a, 1, mask, cursor);
  if (!b) return hold(a);

  const auto length = static_cast<double>(b.time() - a.time());
  const double u = static_cast<double>(time - a.time()) / length;
  Place before, after;
  Tangent leaving, arriving;
  if (interpolation == Interpolation::Cubic) {
    before = neighbour(a, -1, mask, cursor);
    after = neighbour(b, 1, mask, cursor);
    if (before) leaving = {length, static_cast<double>(a.time() - before.time())};
    if (after) arriving = {length, static_cast<double>(after.time() - b.time())};
    if (!before) before = a;
    if (!after) after = b;
  }

  if (m_shape == Shape::Rotation) {
    const auto quatAt = [](Place const& key) {
      return Quat(key.value(3), key.value(0), key.value(1), key.value(2));
    };
    const Quat qa = quatAt(a), qb = nearest(quatAt(b), qa);
    const Quat q = interpolation == Interpolation::Linear
                       ? Imath::slerp(qa, qb, u)
                       : squad(u, leaving, arriving, quatAt(before), qa, qb, quatAt(after));
    values = {q.v.x, q.v.y, q.v.z, q.r};
    return;
  }
  for (int c = 0; c < width(); ++c) {
    if (!wanted(c)) continue;
    const double pa = a.value(c), pb = b.value(c), d = pb - pa;
    double& out = values[static_cast<size_t>(c)];
    if (interpolation == Interpolation::Linear) {
      out = pa + d * u;
    } else {
      out = hermite(u, pa, leaving(d, pa - before.value(c)), pb, arriving(d, after.value(c) - pb));
    }
  }
}

void KeyTrack::evaluate(int64 time, Interpolation interpolation, Values const& defaults, Values& values,
                        Cursor* cursor) const {
  if (!m_root) {
    values = defaults;
    return;
  }
  const Place base = cursor ? placeAtOrBefore(time, *cursor) : placeAtOrBefore(time);
  if (m_root->counts.whole == m_root->counts.keys)
    return evaluateAt(time, interpolation, kAll, base, defaults, values, cursor);
  for (const unsigned component : {1u, 2u, 4u})
    evaluateAt(time, interpolation, component, base, defaults, values, cursor);
}

double KeyTrack::evaluateComponent(int64 time, Interpolation interpolation, int component, double byDefault,
                                   Cursor* cursor) const {
  Values defaults{}, values{};
  defaults[static_cast<size_t>(component)] = byDefault;
  const Place base = cursor ? placeAtOrBefore(time, *cursor) : placeAtOrBefore(time);
  const unsigned mask = m_shape == Shape::Vector ? 1u << component : unsigned{kAll};
  evaluateAt(time, interpolation, mask, base, defaults, values, cursor);
  return values[static_cast<size_t>(component)];
}
