// Edits of the key track. Each copies the shared nodes on its path, changes one leaf or those of a range, and
// brings the counts above up to date on the way back.
#include <algorithm>
#include <atomic>
#include <cassert>

#include "host/keys/KeyTrackPlace.h"

struct KeyTrack::LeafEdit {
  enum class Kind : unsigned char { Erase, EraseSelected, Select, Deselect, Transform };

  Kind kind;
  unsigned mask;
  int64 affected = 0;
  void (*change)(void*, double*) = nullptr;  // Transform
  void* context = nullptr;

  bool erases() const { return kind == Kind::Erase || kind == Kind::EraseSelected; }
  bool dropsWhole() const { return kind == Kind::Erase && mask == kAll; }

  // Nothing below needs to be looked at.
  bool skips(KeyNode const& node) const {
    switch (kind) {
      case Kind::Erase:
      case Kind::Select:
        return !node.counts.holdsAny(mask);
      case Kind::EraseSelected:
      case Kind::Deselect:
        return !node.counts.selectedAny(mask);
      case Kind::Transform:
        return false;
    }
    return false;
  }

  void apply(KeyLeaf& leaf, int first, int last) {
    if (kind == Kind::Transform) {
      leaf.transform(first, last, change, context);
    } else if (dropsWhole()) {
      affected += last - first;
      leaf.erase(first, last);
    } else if (erases()) {
      eraseComponents(leaf, first, last);
    } else {
      changeSelection(leaf, first, last);
    }
  }

 private:
  void changeSelection(KeyLeaf& leaf, int first, int last) {
    for (int slot = first; slot < last; ++slot) {
      const unsigned held = leaf.components(slot), selected = leaf.selected(slot);
      const unsigned touched = mask & (kind == Kind::Select ? held : selected);
      affected += touched != 0;
      leaf.setFlags(slot, held, kind == Kind::Select ? selected | touched : selected & ~touched);
    }
    leaf.dropIdleFlags();
  }

  // Runs of keys that lose everything go at once, from the back, so that the slots before them stay.
  void eraseComponents(KeyLeaf& leaf, int first, int last) {
    int runEnd = last;
    for (int slot = last - 1; slot >= first; --slot) {
      const unsigned held = leaf.components(slot), selected = leaf.selected(slot);
      const unsigned lost = mask & (kind == Kind::Erase ? held : selected);
      affected += lost != 0;
      if (lost == held) continue;

      if (slot + 1 < runEnd) leaf.erase(slot + 1, runEnd);
      runEnd = slot;
      if (lost != 0) {
        constexpr Values kAbsent{};
        leaf.write(slot, kAbsent.data(), lost);
        leaf.setFlags(slot, held & ~lost, selected & ~lost);
      }
    }
    if (first < runEnd) leaf.erase(first, runEnd);
    leaf.dropIdleFlags();
  }
};

void KeyTrack::changed() {
  static std::atomic<uint64> last = 0;
  m_version = last.fetch_add(1, std::memory_order_relaxed) + 1;
}

void KeyTrack::growRoot(KeyNodeRef sibling) {
  auto* root = new KeyInner(m_root->level() + 1, m_limits.fanout);
  KeyNodeRef fresh(root);
  root->insert(0, std::move(m_root));
  root->insert(1, std::move(sibling));
  m_root = std::move(fresh);
}

void KeyTrack::set(int64 time, Values const& values, unsigned mask) {
  mask = normal(mask);
  if (mask == 0) return;
  changed();
  if (!m_root) m_root = KeyNodeRef(new KeyLeaf(width(), m_limits.leafKeys));
  if (KeyNodeRef sibling = setBelow(m_root, time, values, mask)) growRoot(std::move(sibling));
}

// Answers the new node to the right when the node had to split.
KeyNodeRef KeyTrack::setBelow(KeyNodeRef& node, int64 time, Values const& values, unsigned mask) {
  if (node->isLeaf()) return setInLeaf(node, time, values, mask);
  node.own();
  auto& inner = asInner(*node.get());
  const int i = inner.childAtTime(time);
  KeyNodeRef& child = inner.childRef(i);
  const KeyCounts before = child->counts;
  KeyNodeRef sibling = setBelow(child, time, values, mask);
  inner.childChanged(i, before);
  return sibling ? inner.insert(i + 1, std::move(sibling)) : KeyNodeRef();
}

KeyNodeRef KeyTrack::setInLeaf(KeyNodeRef& node, int64 time, Values const& values, unsigned mask) {
  const auto insertInto = [&](KeyLeaf& leaf, int slot) {
    Values held{};
    for (size_t c = 0; c < held.size(); ++c)
      if (m_shape != Shape::Vector || mask >> c & 1) held[c] = values[c];
    leaf.insert(slot, time, held.data(), mask);
  };

  const auto& old = asLeaf(*node.get());
  const int size = old.size();
  const int slot = size == 0 ? 0 : old.lowerBound(time);
  const bool present = slot < size && old.time(slot) == time;
  if (present || !old.full()) {
    node.own();
    auto& leaf = asLeaf(*node.get());
    if (present) {
      leaf.write(slot, values.data(), mask);
      leaf.dropIdleFlags();
    } else {
      insertInto(leaf, slot);
    }
    return {};
  }

  // Keys that arrive in order, from either end, leave full leaves behind; others halve them.
  auto* fresh = new KeyLeaf(width(), m_limits.leafKeys);
  KeyNodeRef sibling(fresh);
  if (slot == 0 || slot == size) {
    insertInto(*fresh, 0);
    if (slot == 0) std::swap(node, sibling);
    return sibling;
  }
  node.own();
  auto& left = asLeaf(*node.get());
  const int half = size / 2;
  fresh->append(left, half, size);
  left.erase(half, size);
  if (slot <= half) {
    insertInto(left, slot);
  } else {
    insertInto(*fresh, slot - half);
  }
  return sibling;
}

void KeyTrack::append(int64 start, int64 period, const double* values, int64 n) {
  if (n <= 0) return;
  assert((n == 1 || period > 0) && (empty() || start > timeAt(count() - 1)));
  changed();
  while (n > 0) {
    const Place last = placeAt(count() - 1);
    const int64 used = last && !last.leaf->full() ? last.leaf->size() : 0;
    const int some = static_cast<int>(std::min(n, m_limits.leafKeys - used));
    KeyNodeRef sibling;
    if (m_root) {
      sibling = appendBelow(m_root, start, period, values, some);
    } else {
      auto* leaf = new KeyLeaf(width(), m_limits.leafKeys);
      m_root = KeyNodeRef(leaf);
      leaf->append(start, period, values, some);
    }
    if (sibling) growRoot(std::move(sibling));
    start += period * some;
    values += static_cast<int64>(some) * width();
    n -= some;
  }
}

// Appends n keys, which fit the last leaf or, when that is full, a new one.
KeyNodeRef KeyTrack::appendBelow(KeyNodeRef& node, int64 start, int64 period, const double* values, int n) {
  if (node->isLeaf()) {
    if (asLeaf(*node.get()).full()) {
      auto* fresh = new KeyLeaf(width(), m_limits.leafKeys);
      fresh->append(start, period, values, n);
      return KeyNodeRef(fresh);
    }
    node.own();
    asLeaf(*node.get()).append(start, period, values, n);
    return {};
  }
  node.own();
  auto& inner = asInner(*node.get());
  const int i = inner.size() - 1;
  KeyNodeRef& child = inner.childRef(i);
  const KeyCounts before = child->counts;
  KeyNodeRef sibling = appendBelow(child, start, period, values, n);
  inner.childChanged(i, before);
  return sibling ? inner.insert(i + 1, std::move(sibling)) : KeyNodeRef();
}

int64 KeyTrack::edit(int64 firstIndex, int64 lastIndex, LeafEdit& what) {
  firstIndex = std::max<int64>(firstIndex, 0);
  lastIndex = std::min(lastIndex, count());
  if (firstIndex >= lastIndex || what.skips(*m_root.get())) return 0;
  changed();
  editBelow(m_root, firstIndex, lastIndex, what);
  while (m_root && !m_root->isLeaf() && asInner(*m_root.get()).size() == 1) {
    KeyNodeRef only = asInner(*m_root.get()).childRef(0);
    m_root = std::move(only);
  }
  return what.affected;
}

// Edits the keys with the indices [first, last) of the node; a node that loses all of them becomes null.
void KeyTrack::editBelow(KeyNodeRef& node, int64 first, int64 last, LeafEdit& what) {
  if (what.skips(*node.get())) return;
  if (what.dropsWhole() && first == 0 && last == node->counts.keys) {
    what.affected += last;
    node.reset();
    return;
  }
  node.own();
  if (node->isLeaf()) {
    auto& leaf = asLeaf(*node.get());
    what.apply(leaf, static_cast<int>(first), static_cast<int>(last));
    if (leaf.size() == 0) node.reset();
    return;
  }

  auto& inner = asInner(*node.get());
  int64 from = first;
  const int firstChild = inner.childAtIndex(from);
  int64 before = first - from;
  int i = firstChild;
  for (; i < inner.size() && before < last; ++i) {
    const int64 keys = inner.keys(i);
    KeyNodeRef& child = inner.childRef(i);
    const KeyCounts counts = child->counts;
    editBelow(child, std::max<int64>(first - before, 0), std::min(last - before, keys), what);
    inner.childChanged(i, counts);
    before += keys;
  }
  if (what.erases()) inner.mend(firstChild, i - 1);
  if (inner.size() == 0) node.reset();
}

int64 KeyTrack::erase(int64 index, unsigned mask) {
  LeafEdit what{LeafEdit::Kind::Erase, normal(mask)};
  return edit(index, index + 1, what);
}

int64 KeyTrack::eraseRange(int64 first, int64 last, unsigned mask) {
  if (first > last) return 0;
  LeafEdit what{LeafEdit::Kind::Erase, normal(mask)};
  return edit(lowerBound(first), placeAtOrBefore(last).index + 1, what);
}

int64 KeyTrack::eraseSelected(unsigned mask) {
  LeafEdit what{LeafEdit::Kind::EraseSelected, normal(mask)};
  return edit(0, count(), what);
}

void KeyTrack::clear() {
  changed();
  m_root.reset();
}

int64 KeyTrack::select(int64 first, int64 last, unsigned mask) {
  if (first > last) return 0;
  LeafEdit what{LeafEdit::Kind::Select, normal(mask)};
  return edit(lowerBound(first), placeAtOrBefore(last).index + 1, what);
}

int64 KeyTrack::deselect(int64 first, int64 last, unsigned mask) {
  if (first > last) return 0;
  LeafEdit what{LeafEdit::Kind::Deselect, normal(mask)};
  return edit(lowerBound(first), placeAtOrBefore(last).index + 1, what);
}

void KeyTrack::setSelected(int64 index, unsigned flags) {
  const Place place = placeAt(index);
  const unsigned wanted = normal(flags) & place.leaf->components(place.slot);
  const unsigned now = place.leaf->selected(place.slot);
  if (const unsigned extra = now & ~wanted) {
    LeafEdit what{LeafEdit::Kind::Deselect, extra};
    edit(index, index + 1, what);
  }
  if (const unsigned missing = wanted & ~now) {
    LeafEdit what{LeafEdit::Kind::Select, missing};
    edit(index, index + 1, what);
  }
}

void KeyTrack::transformLeaves(void (*change)(void*, double*), void* context) {
  LeafEdit what{LeafEdit::Kind::Transform, kAll};
  what.change = change;
  what.context = context;
  edit(0, count(), what);
}
