// A key track as plainly as it can be written: a sorted vector, every query looks at all
// keys.
#pragma once

#include <algorithm>
#include <vector>

#include "host/keys/KeyTrack.h"

class KeyTrackModel {
 public:
  using Key = KeyTrack::Key;
  using Shape = KeyTrack::Shape;

  explicit KeyTrackModel(Shape shape) : m_shape(shape) {}

  std::vector<Key> keys;

  unsigned normal(unsigned mask) const { return m_shape == Shape::Vector ? mask & 7 : mask ? 7 : 0; }
  int64 size() const { return static_cast<int64>(keys.size()); }
  Key& at(int64 i) { return keys[static_cast<size_t>(i)]; }
  Key const& at(int64 i) const { return keys[static_cast<size_t>(i)]; }

  int64 lowerBound(int64 time) const {
    return std::count_if(keys.begin(), keys.end(), [time](Key const& k) { return k.time < time; });
  }
  int64 find(int64 time) const {
    int64 const i = lowerBound(time);
    return i < size() && at(i).time == time ? i : -1;
  }
  int64 countHolding(unsigned mask) const {
    mask = normal(mask);
    return std::count_if(keys.begin(), keys.end(),
                         [mask](Key const& k) { return (k.components & mask) == mask; });
  }
  int64 countSelected(unsigned mask) const {
    mask = normal(mask);
    return std::count_if(keys.begin(), keys.end(), [mask](Key const& k) { return (k.selected & mask) != 0; });
  }
  // The first key after `index`, in steps of `step`, whose flags meet the mask.
  int64 walk(int64 index, int step, unsigned char Key::*flags, unsigned mask, bool any = true) const {
    mask = normal(mask);
    for (index = std::clamp<int64>(index, -1, size()) + step; index >= 0 && index < size(); index += step)
      if (((at(index).*flags & mask) != 0) == any) return index;
    return -1;
  }

  void set(int64 time, KeyTrack::Values const& values, unsigned mask) {
    mask = normal(mask);
    if (!mask) return;
    int64 i = find(time);
    if (i < 0) {
      i = lowerBound(time);
      keys.insert(keys.begin() + i, Key{time, {}, 0, 0});
    }
    Key& key = at(i);
    key.bridges |= static_cast<unsigned char>(bridgedAt(time) & mask & ~key.components);
    key.components |= static_cast<unsigned char>(mask);
    for (size_t c = 0; c < static_cast<size_t>(m_shape); ++c)
      if (m_shape != Shape::Vector || mask >> c & 1) key.values[c] = values[c];
  }

  // Components with data at a time because a bridge passes over it or reaches it.
  unsigned bridgedAt(int64 time) const {
    unsigned bridged = 0;
    for (Key const& key : keys)
      if (key.time < time) bridged = (bridged & ~key.components) | key.bridges;
    return bridged;
  }
  // The components that have data at first, first + period, ..., last.
  std::vector<unsigned> dataAt(int64 first, int64 last, int64 period) const {
    std::vector<unsigned> data;
    unsigned bridged = 0;
    auto key = keys.begin();
    for (int64 time = first; time <= last; time += period) {
      for (; key != keys.end() && key->time < time; ++key)
        bridged = (bridged & ~key->components) | key->bridges;
      data.push_back(bridged | (key != keys.end() && key->time == time ? key->components : 0u));
    }
    return data;
  }
  int64 nextHolder(int64 index, unsigned component) const {
    return walk(index, 1, &Key::components, component);
  }

  // Calls change(key) for the keys in the time range, then drops those that hold nothing any more, and
  // bridges to what was lost.
  template <class Change>
  int64 edit(int64 first, int64 last, Change change) {
    int64 changed = 0;
    std::vector<Key> const before = keys;
    for (Key& key : keys)
      if (key.time >= first && key.time <= last) changed += change(key);
    for (unsigned c = 1; c < 8; c *= 2) {
      Key* holder = nullptr;
      for (size_t i = 0; i < keys.size(); ++i) {
        if (!(before[i].components & c)) continue;
        if (holder && !(keys[i].components & c)) holder->bridges &= static_cast<unsigned char>(~c);
        holder = &keys[i];
      }
      if (holder) holder->bridges &= static_cast<unsigned char>(~c);
    }
    std::erase_if(keys, [](Key const& k) { return k.components == 0; });
    return changed;
  }

  int64 thin(std::vector<unsigned char> const& lost) {
    for (unsigned c = 1; c < 8; c *= 2) {
      Key* kept = nullptr;
      bool loses = false;
      for (size_t i = 0; i < keys.size(); ++i) {
        if (!(keys[i].components & c)) continue;
        loses = loses || (lost[i] & c);
        if (lost[i] & c) continue;
        if (kept && loses) kept->bridges |= static_cast<unsigned char>(c);
        kept = &keys[i];
        loses = false;
      }
    }
    int64 changed = 0;
    for (size_t i = 0; i < keys.size(); ++i) changed += lose(keys[i], lost[i] & keys[i].components);
    std::erase_if(keys, [](Key const& k) { return k.components == 0; });
    return changed;
  }

  void bridge(int64 first, int64 last, unsigned mask, bool on) {
    edit(first, last, [mask = normal(mask), on](Key& k) {
      auto const bits = static_cast<unsigned char>(mask & k.components);
      k.bridges = static_cast<unsigned char>(on ? k.bridges | bits : k.bridges & ~bits);
      return true;
    });
  }

  int64 eraseRange(int64 first, int64 last, unsigned mask) {
    return edit(first, last, [mask = normal(mask)](Key& k) { return lose(k, mask & k.components); });
  }
  int64 eraseSelected(unsigned mask) {
    return edit(INT64_MIN, INT64_MAX, [mask = normal(mask)](Key& k) { return lose(k, mask & k.selected); });
  }
  int64 select(int64 first, int64 last, unsigned mask) {
    return edit(first, last, [mask = normal(mask)](Key& k) {
      k.selected |= static_cast<unsigned char>(mask & k.components);
      return (mask & k.components) != 0;
    });
  }
  int64 deselect(int64 first, int64 last, unsigned mask) {
    return edit(first, last, [mask = normal(mask)](Key& k) {
      bool const had = (k.selected & mask) != 0;
      k.selected &= static_cast<unsigned char>(~mask);
      return had;
    });
  }

 private:
  static bool lose(Key& key, unsigned lost) {
    for (size_t c = 0; c < 3; ++c)
      if (lost >> c & 1) key.values[c] = 0;
    key.components &= static_cast<unsigned char>(~lost);
    key.selected &= static_cast<unsigned char>(~lost);
    key.bridges &= static_cast<unsigned char>(~lost);
    return lost != 0;
  }

  Shape m_shape;
};
