// Evaluation of the key track between its keys.
#include "host/keys/KeyInterpolation.h"
#include "host/keys/KeyTrackPlace.h"

// As placeAtOrBefore(time), with the search spared while the time stays in the cursor's leaf or enters the
// next.
KeyTrack::Place KeyTrack::placeAtOrBefore(int64 time, Cursor& cursor) const {
  if (!m_root) return {};
  auto const leafAt = [this](int64 index) { return placeAt(index).leaf; };
  bool const known = cursor.leaf && cursor.version == m_version && time >= cursor.leaf->firstTime();
  if (known && cursor.next && time >= cursor.next->firstTime()) {
    cursor.firstIndex += cursor.leaf->size();
    cursor.leaf = cursor.next;
    cursor.next = leafAt(cursor.firstIndex + cursor.leaf->size());
    cursor.slot = 0;
  }
  if (!known || (cursor.next && time >= cursor.next->firstTime())) {
    Place const place = placeAtOrBefore(time);
    if (!place) return place;
    int64 const first = place.index - place.slot;
    cursor = {place.leaf, leafAt(first + place.leaf->size()), first, place.slot, m_version};
    return place;
  }
  cursor.slot = cursor.leaf->lastAtOrBefore(time, cursor.slot);
  return {cursor.leaf, cursor.firstIndex + cursor.slot, cursor.slot};
}

// The next (step 1) or previous (step -1) key that holds a component of the mask.
KeyTrack::Place KeyTrack::neighbour(Place const& from, int step, unsigned mask, Cursor const* cursor) const {
  KeyLeaf const& leaf = *from.leaf;
  int const slot = step > 0 ? (from.slot + 1 < leaf.size() ? leaf.nextHolding(from.slot + 1, mask) : -1)
                            : leaf.previousHolding(from.slot - 1, mask);
  if (slot >= 0) return {&leaf, from.index + slot - from.slot, slot};
  if (step > 0 && cursor && cursor->leaf == &leaf) {
    if (!cursor->next) return {};
    int const ahead = cursor->next->nextHolding(0, mask);
    if (ahead >= 0) return {cursor->next, cursor->firstIndex + leaf.size() + ahead, ahead};
  }
  int64 const index = step > 0 ? nextHolding(from.index, mask) : previousHolding(from.index, mask);
  return index < 0 ? Place() : placeAt(index);
}

void KeyTrack::evaluateAt(int64 time, Interpolation interpolation, unsigned mask, Place const& base,
                          Values const& defaults, Values& values, Cursor const* cursor) const {
  bool const split = m_shape == Shape::Vector && mask != kAll;
  auto const wanted = [&](int c) { return !split || (mask >> c & 1); };
  auto const hold = [&](Place const& key) {
    for (int c = 0; c < width(); ++c)
      if (wanted(c)) values[static_cast<size_t>(c)] = key ? key.value(c) : defaults[static_cast<size_t>(c)];
  };

  // The keys around the time: a at or before it, b after it.
  Place a = base;
  if (a && !(a.leaf->components(a.slot) & mask)) a = neighbour(a, -1, mask, cursor);
  if (!a) {
    int64 const first = nextHolding(-1, mask);
    return hold(first < 0 ? Place() : placeAt(first));
  }
  if (interpolation == Interpolation::Constant || a.time() == time) return hold(a);
  Place const b = neighbour(a, 1, mask, cursor);
  if (!b) return hold(a);

  Place before, after;
  if (interpolation == Interpolation::Cubic) {
    before = neighbour(a, -1, mask, cursor);
    after = neighbour(b, 1, mask, cursor);
  }
  interpolateKeys(m_shape, interpolation, time, before, a, b, after, wanted, values);
}

void KeyTrack::evaluate(int64 time, Interpolation interpolation, Values const& defaults, Values& values,
                        Cursor* cursor) const {
  if (!m_root) {
    values = defaults;
    return;
  }
  Place const base = cursor ? placeAtOrBefore(time, *cursor) : placeAtOrBefore(time);
  if (m_root->counts.whole == m_root->counts.keys)
    return evaluateAt(time, interpolation, kAll, base, defaults, values, cursor);
  for (unsigned const component : {1u, 2u, 4u})
    evaluateAt(time, interpolation, component, base, defaults, values, cursor);
}

double KeyTrack::evaluateComponent(int64 time, Interpolation interpolation, int component, double byDefault,
                                   Cursor* cursor) const {
  Values defaults{}, values{};
  defaults[static_cast<size_t>(component)] = byDefault;
  Place const base = cursor ? placeAtOrBefore(time, *cursor) : placeAtOrBefore(time);
  unsigned const mask = m_shape == Shape::Vector ? 1u << component : unsigned{kAll};
  evaluateAt(time, interpolation, mask, base, defaults, values, cursor);
  return values[static_cast<size_t>(component)];
}
