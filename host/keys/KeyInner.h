// An inner node of a key track's tree: up to `fanout` children of one level, with their first times and
// numbers of keys beside each other, so that a search touches only the children on its path.
#pragma once

#include <algorithm>
#include <array>

#include "host/keys/KeyLeaf.h"
#include "host/keys/KeyNode.h"

class KeyInner final : public KeyNode {
 public:
  static constexpr int kMaxFanout = 32;

  KeyInner(int level, int fanout) : KeyNode(level), m_fanout(fanout) {}
  KeyInner(KeyInner const&) = default;

  int size() const { return m_size; }
  bool full() const { return m_size >= m_fanout; }
  KeyNode const& child(int i) const { return *m_children[at(i)].get(); }
  KeyNodeRef& childRef(int i) { return m_children[at(i)]; }
  int64 firstTime(int i = 0) const { return m_firstTimes[at(i)]; }
  int64 keys(int i) const { return m_keys[at(i)]; }

  // The child whose span the time falls into: the last one that starts at or before it, else the first.
  int childAtTime(int64 time) const {
    auto const begin = m_firstTimes.begin();
    return static_cast<int>(std::upper_bound(begin + 1, begin + m_size, time) - begin) - 1;
  }
  // The child with the key of this index, which becomes its index in the child. An index after the last key
  // falls into the last child.
  int childAtIndex(int64& index) const {
    int i = 0;
    for (; i + 1 < m_size && index >= m_keys[at(i)]; ++i) index -= m_keys[at(i)];
    return i;
  }
  int64 keysBefore(int i) const;

  // To be called after child i has changed, which may be an empty reference then; `gained`: what its counts
  // are more than before.
  void childGained(int i, KeyCounts const& gained);
  // The same after it got keys from a time on, but for the counts of all.
  void keysAdded(int i, int64 time) {
    m_keys[at(i)] = m_children[at(i)]->counts.keys;
    m_firstTimes[at(i)] = std::min(m_firstTimes[at(i)], time);
  }
  // Adds a child at position i. A full node splits: `spare`, an empty node of the same level, becomes the one
  // to its right and is returned.
  KeyNodeRef insert(int i, KeyNodeRef child, KeyNodeRef spare) noexcept;
  // Removes the empty references among the children from `first` on; returns how many there were.
  int closeGaps(int first) noexcept;
  // Joins neighbours among the children before `first` to after `last` as far as there is memory for it:
  // small ones, or with `tightly` all that fit one node. True when some were.
  bool join(int first, int last, bool tightly) noexcept;

 private:
  static size_t at(int i) { return static_cast<size_t>(i); }
  void place(int i, KeyNodeRef child);
  void moveTail(int from, KeyInner& to);
  bool joins(int i, int64 limit, bool tightly) const;
  bool joinTwo(int i);
  void append(KeyInner& from, bool isShared);
  void remove(int i);

  int m_fanout;
  int m_size = 0;
  std::array<int64, kMaxFanout> m_firstTimes{};
  std::array<int64, kMaxFanout> m_keys{};
  std::array<KeyNodeRef, kMaxFanout> m_children;
};

inline KeyLeaf const& asLeaf(KeyNode const& node) { return static_cast<KeyLeaf const&>(node); }
inline KeyInner const& asInner(KeyNode const& node) { return static_cast<KeyInner const&>(node); }
inline KeyLeaf& asLeaf(KeyNode& node) { return static_cast<KeyLeaf&>(node); }
inline KeyInner& asInner(KeyNode& node) { return static_cast<KeyInner&>(node); }

inline int64 firstTimeOf(KeyNode const& node) {
  return node.isLeaf() ? asLeaf(node).firstTime() : asInner(node).firstTime();
}
inline void KeyInner::childGained(int i, KeyCounts const& gained) {
  counts += gained;
  KeyNode const* child = m_children[at(i)].get();
  m_keys[at(i)] = child ? child->counts.keys : 0;
  if (child) m_firstTimes[at(i)] = firstTimeOf(*child);
}

inline int64 lastTimeOf(KeyNode const& node) {
  if (node.isLeaf()) return asLeaf(node).lastTime();
  auto const& inner = asInner(node);
  return lastTimeOf(inner.child(inner.size() - 1));
}
