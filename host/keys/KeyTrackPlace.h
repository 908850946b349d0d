// A key of a track by where it lies. Valid until the track changes.
#pragma once

#include <array>

#include "host/keys/KeyInner.h"
#include "host/keys/KeyTrack.h"

struct KeyTrack::Place {
  KeyLeaf const* leaf = nullptr;  // null: there is no such key
  int64 index = -1;
  int slot = 0;

  explicit operator bool() const { return leaf != nullptr; }
  int64 time() const { return leaf->time(slot); }
  double value(int component) const { return leaf->value(slot, component); }
  unsigned bridges() const { return leaf->bridges(slot); }
  unsigned selected() const { return leaf->selected(slot); }
};

// The parts of a key that a mask means, each as a mask: the components of vectors, else the whole.
class KeyParts {
 public:
  KeyParts(KeyTrack::Shape shape, unsigned mask) {
    if (shape != KeyTrack::Shape::Vector) {
      if (mask) m_parts[m_size++] = KeyTrack::kAll;
      return;
    }
    for (unsigned const component : {1u, 2u, 4u})
      if (mask & component) m_parts[m_size++] = component;
  }
  unsigned const* begin() const { return m_parts.data(); }
  unsigned const* end() const { return m_parts.data() + m_size; }

 private:
  std::array<unsigned, 3> m_parts{};
  size_t m_size = 0;
};
