// Queries of the key track. Edits and evaluation have files of their own.
#include "host/keys/KeyTrack.h"

#include <algorithm>
#include <bit>
#include <cassert>
#include <cstring>

#include "host/keys/KeyTrackPlace.h"

namespace {

// What a walk looks for: keys that hold, or are selected on, any component of the mask, or those that are
// selected on none.
struct Wanted {
  enum Kind { holding, selected, unselected };
  unsigned mask;
  Kind kind;

  bool below(KeyNode const& node) const {
    return kind == holding    ? node.counts.holdsAny(mask)
           : kind == selected ? node.counts.selectedAny(mask)
                              : node.counts.unselectedAny(mask);
  }
  int next(KeyLeaf const& leaf, int slot) const {
    return kind == holding    ? leaf.nextHolding(slot, mask)
           : kind == selected ? leaf.nextSelected(slot, mask)
                              : leaf.nextUnselected(slot, mask);
  }
  int previous(KeyLeaf const& leaf, int slot) const {
    return kind == holding    ? leaf.previousHolding(slot, mask)
           : kind == selected ? leaf.previousSelected(slot, mask)
                              : leaf.previousUnselected(slot, mask);
  }
};

// The first wanted key at or after index `from` of the node, -1 when there is none.
int64 findNext(KeyNode const& node, int64 from, Wanted const& wanted) {
  if (from >= node.counts.keys || !wanted.below(node)) return -1;
  if (node.isLeaf()) return wanted.next(asLeaf(node), static_cast<int>(from));

  auto const& inner = asInner(node);
  int64 before = from;
  int i = inner.childAtIndex(from);
  before -= from;
  for (; i < inner.size(); before += inner.keys(i++), from = 0) {
    int64 const found = findNext(inner.child(i), from, wanted);
    if (found >= 0) return before + found;
  }
  return -1;
}

// The last wanted key at or before index `from` of the node, -1 when there is none.
int64 findPrevious(KeyNode const& node, int64 from, Wanted const& wanted) {
  if (from < 0 || !wanted.below(node)) return -1;
  if (node.isLeaf()) return wanted.previous(asLeaf(node), static_cast<int>(from));

  auto const& inner = asInner(node);
  int64 before = from;
  int i = inner.childAtIndex(from);
  before -= from;
  for (;;) {
    int64 const found = findPrevious(inner.child(i), from, wanted);
    if (found >= 0) return before + found;
    if (--i < 0) return -1;
    before -= inner.keys(i);
    from = inner.keys(i) - 1;
  }
}

// The sum of count(leaf) over the leaves below a node.
template <class Count>
int64 sumLeaves(KeyNode const& node, Count count) {
  if (node.isLeaf()) return count(asLeaf(node));
  int64 sum = 0;
  for (int i = 0; i < asInner(node).size(); ++i) sum += sumLeaves(asInner(node).child(i), count);
  return sum;
}

int64 bytesOf(KeyNode const& node) {
  if (node.isLeaf()) return asLeaf(node).memoryUse();
  int64 sum = static_cast<int64>(sizeof(KeyInner));
  for (int i = 0; i < asInner(node).size(); ++i) sum += bytesOf(asInner(node).child(i));
  return sum;
}

int64 bytesAloneOf(KeyNode const& node) {
  if (node.isShared()) return 0;
  if (node.isLeaf()) return asLeaf(node).memoryUse();
  int64 sum = static_cast<int64>(sizeof(KeyInner));
  for (int i = 0; i < asInner(node).size(); ++i) sum += bytesAloneOf(asInner(node).child(i));
  return sum;
}

char const* brokenInvariant(KeyNode const& node) {
  if (node.isLeaf()) return asLeaf(node).checkInvariants();
  auto const& inner = asInner(node);
  if (inner.size() == 0) return "an inner node is empty";

  KeyCounts expected;
  for (int i = 0; i < inner.size(); ++i) {
    KeyNode const& child = inner.child(i);
    if (child.level() != node.level() - 1) return "a child has the wrong level";
    if (char const* broken = brokenInvariant(child)) return broken;
    if (i > 0 && firstTimeOf(child) <= lastTimeOf(inner.child(i - 1))) return "key times do not ascend";
    if (inner.firstTime(i) != firstTimeOf(child)) return "the first time of a child is wrong";
    if (inner.keys(i) != child.counts.keys) return "the number of keys of a child is wrong";
    expected += child.counts;
  }
  if (!(expected == node.counts)) return "the counts of an inner node are wrong";
  return nullptr;
}

KeyTrack::Key keyIn(KeyLeaf const& leaf, int slot) {
  KeyTrack::Key key;
  key.time = leaf.time(slot);
  key.components = static_cast<unsigned char>(leaf.components(slot));
  key.selected = static_cast<unsigned char>(leaf.selected(slot));
  key.bridges = static_cast<unsigned char>(leaf.bridges(slot));
  leaf.values(slot, key.values.data());
  return key;
}

}  // namespace

KeyTrack::KeyTrack(Shape shape) : KeyTrack(shape, Limits()) {}

KeyTrack::KeyTrack(Shape shape, Limits limits) : m_limits(limits), m_shape(shape) {
  assert(limits.leafKeys >= 4 && limits.fanout >= 4 && limits.fanout <= KeyInner::kMaxFanout);
}

int64 KeyTrack::countHolding(unsigned mask) const {
  mask = normal(mask);
  if (!m_root || mask == 0) return count();
  if (mask == kAll) return m_root->counts.whole;
  if (std::has_single_bit(mask)) return m_root->counts.held[std::countr_zero(mask)];
  return sumLeaves(*m_root.get(), [mask](KeyLeaf const& leaf) {
    if (leaf.plain()) return leaf.counts.keys;
    int64 sum = 0;
    for (int slot = 0; slot < leaf.size(); ++slot) sum += (leaf.components(slot) & mask) == mask;
    return sum;
  });
}

int64 KeyTrack::countSelected(unsigned mask) const {
  mask = normal(mask);
  if (!m_root || mask == 0) return 0;
  if (mask == kAll) return m_root->counts.selected;
  if (std::has_single_bit(mask)) return m_root->counts.selectedOn[std::countr_zero(mask)];
  return sumLeaves(*m_root.get(), [mask](KeyLeaf const& leaf) {
    int64 sum = 0;
    if (leaf.counts.selected > 0)
      for (int slot = 0; slot < leaf.size(); ++slot) sum += (leaf.selected(slot) & mask) != 0;
    return sum;
  });
}

KeyTrack::Place KeyTrack::placeAt(int64 index) const {
  Place place{nullptr, index, 0};
  if (index < 0 || index >= count()) return place;
  KeyNode const* node = m_root.get();
  while (!node->isLeaf()) node = &asInner(*node).child(asInner(*node).childAtIndex(index));
  place.leaf = &asLeaf(*node);
  place.slot = static_cast<int>(index);
  return place;
}

// No leaf, and index -1, when the time lies before the first key.
KeyTrack::Place KeyTrack::placeAtOrBefore(int64 time) const {
  if (!m_root || time < firstTimeOf(*m_root.get())) return {};
  KeyNode const* node = m_root.get();
  int64 before = 0;
  while (!node->isLeaf()) {
    auto const& inner = asInner(*node);
    int const i = inner.childAtTime(time);
    before += inner.keysBefore(i);
    node = &inner.child(i);
  }
  int const slot = asLeaf(*node).lastAtOrBefore(time);
  return {&asLeaf(*node), before + slot, slot};
}

KeyTrack::Key KeyTrack::at(int64 index) const {
  Place const place = placeAt(index);
  return keyIn(*place.leaf, place.slot);
}

int64 KeyTrack::timeAt(int64 index) const { return placeAt(index).time(); }

int64 KeyTrack::selectedIndex(int64 i) const {
  KeyNode const* node = m_root.get();
  int64 before = 0;
  while (!node->isLeaf()) {
    auto const& inner = asInner(*node);
    int k = 0;
    for (; i >= inner.child(k).counts.selected; ++k) {
      i -= inner.child(k).counts.selected;
      before += inner.keys(k);
    }
    node = &inner.child(k);
  }
  auto const& leaf = asLeaf(*node);
  int slot = leaf.nextSelected(0, kAll);
  for (; i > 0; --i) slot = leaf.nextSelected(slot + 1, kAll);
  return before + slot;
}

int64 KeyTrack::find(int64 time) const {
  Place const place = placeAtOrBefore(time);
  return place && place.time() == time ? place.index : -1;
}

int64 KeyTrack::lowerBound(int64 time) const {
  Place const place = placeAtOrBefore(time);
  return place && place.time() == time ? place.index : place.index + 1;
}

unsigned KeyTrack::bridgedAt(int64 time, unsigned mask) const {
  unsigned bridged = 0;
  if (!bridgesAny(mask)) return bridged;
  int64 const index = lowerBound(time);
  if (index == count()) return bridged;
  for (unsigned const part : KeyParts(m_shape, mask)) {
    int64 const before = previousHolding(index, part);
    if (before >= 0) bridged |= placeAt(before).bridges() & part;
  }
  return bridged;
}

int64 KeyTrack::nextHolding(int64 index, unsigned mask) const {
  return m_root ? findNext(*m_root.get(), std::max<int64>(index + 1, 0), {normal(mask), Wanted::holding})
                : -1;
}

int64 KeyTrack::previousHolding(int64 index, unsigned mask) const {
  return m_root ? findPrevious(*m_root.get(), std::min(index, count()) - 1, {normal(mask), Wanted::holding})
                : -1;
}

int64 KeyTrack::nextSelected(int64 index, unsigned mask) const {
  return m_root ? findNext(*m_root.get(), std::max<int64>(index + 1, 0), {normal(mask), Wanted::selected})
                : -1;
}

int64 KeyTrack::previousSelected(int64 index, unsigned mask) const {
  return m_root ? findPrevious(*m_root.get(), std::min(index, count()) - 1, {normal(mask), Wanted::selected})
                : -1;
}

int64 KeyTrack::nextUnselected(int64 index, unsigned mask) const {
  return m_root ? findNext(*m_root.get(), std::max<int64>(index + 1, 0), {normal(mask), Wanted::unselected})
                : -1;
}

int64 KeyTrack::previousUnselected(int64 index, unsigned mask) const {
  return m_root
             ? findPrevious(*m_root.get(), std::min(index, count()) - 1, {normal(mask), Wanted::unselected})
             : -1;
}

KeyTrack::Key KeyTrack::Reader::next() {
  if (!m_leaf || m_slot == m_leaf->size()) {
    Place const place = m_track.placeAt(m_index);
    m_leaf = place.leaf;
    m_slot = place.slot;
  }
  ++m_index;
  return keyIn(*m_leaf, m_slot++);
}

bool KeyTrack::operator==(KeyTrack const& o) const {
  if (m_shape != o.m_shape || count() != o.count()) return false;
  if (m_root == o.m_root) return true;
  if (!(m_root->counts == o.m_root->counts)) return false;
  Reader mine(*this, 0), theirs(o, 0);
  for (int64 i = 0; i < count(); ++i) {
    Key const a = mine.next(), b = theirs.next();
    if (a.time != b.time || a.components != b.components || a.selected != b.selected ||
        a.bridges != b.bridges || std::memcmp(a.values.data(), b.values.data(), sizeof(Values)) != 0)
      return false;
  }
  return true;
}

bool KeyTrack::sharesAll(KeyTrack const& o) const { return m_shape == o.m_shape && m_root == o.m_root; }

int64 KeyTrack::memoryUse() const {
  return static_cast<int64>(sizeof *this) + (m_root ? bytesOf(*m_root.get()) : 0);
}

int64 KeyTrack::memoryAlone() const { return m_root ? bytesAloneOf(*m_root.get()) : 0; }

char const* KeyTrack::checkInvariants() const {
  char const* broken = m_root ? brokenInvariant(*m_root.get()) : nullptr;
  for (unsigned const part : KeyParts(m_shape, kAll)) {
    Place const last = placeAt(broken ? -1 : previousHolding(count(), part));
    if (last && last.bridges() & part) broken = "the last key that holds a component bridges it";
  }
  return broken ? broken : "";
}
