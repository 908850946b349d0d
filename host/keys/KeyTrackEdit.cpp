// Edits of the key track. Each copies the shared nodes on its path, changes one leaf or those of a range, and
// brings the counts above up to date on the way back.
#include <algorithm>
#include <array>
#include <atomic>
#include <cassert>
#include <numeric>

#include "host/base/ThreadLocal.h"
#include "host/keys/KeyTrackPlace.h"
#include "host/time/Ticks.h"

struct KeyTrack::LeafEdit {
  enum class Kind : unsigned char {
    Erase,
    EraseSelected,
    Thin,
    Select,
    Deselect,
    Bridge,
    Unbridge,
    Transform
  };

  Kind kind;
  unsigned mask;
  int64 affected = 0;
  void (*change)(void*, double*) = nullptr;  // Transform
  void* context = nullptr;
  // Thin: what each key from the next one to be visited loses, and bridges from now on.
  unsigned char const *lost = nullptr, *bridged = nullptr;
  std::vector<int> kept{};  // slots of the leaf that is edited

  bool erases() const { return kind == Kind::Erase || kind == Kind::EraseSelected || kind == Kind::Thin; }
  bool dropsWhole() const { return kind == Kind::Erase && mask == kAll; }

  // Nothing below needs to be looked at. Thin visits all keys, so that a node's keys are the next ones.
  bool skips(KeyNode const& node) {
    switch (kind) {
      case Kind::Thin:
        for (int64 i = 0; i < node.counts.keys; ++i)
          if (lost[i] || bridged[i]) return false;
        lost += node.counts.keys;
        bridged += node.counts.keys;
        return true;
      case Kind::Erase:
      case Kind::Select:
      case Kind::Bridge:
        return !node.counts.holdsAny(mask);
      case Kind::EraseSelected:
      case Kind::Deselect:
        return !node.counts.selectedAny(mask);
      case Kind::Unbridge:
        return !node.counts.bridgesAny(mask);
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
      bool const bridges = kind == Kind::Bridge || kind == Kind::Unbridge;
      affected += leaf.mark(bridges ? KeyLeaf::Mark::Bridged : KeyLeaf::Mark::Selected,
                            kind == Kind::Select || kind == Kind::Bridge, mask, first, last);
    }
  }

 private:
  void eraseComponents(KeyLeaf& leaf, int first, int last) {
    kept.resize(static_cast<size_t>(first));
    std::iota(kept.begin(), kept.end(), 0);
    for (int slot = first; slot < last; ++slot) {
      KeyFlags const now = leaf.flags(slot);
      unsigned const gone = kind == Kind::Thin    ? lost[slot] & now.components
                            : kind == Kind::Erase ? mask & now.components
                                                  : mask & now.selected;
      affected += gone != 0;
      if (gone == now.components) continue;
      kept.push_back(slot);
      unsigned const added = kind == Kind::Thin ? bridged[slot] : 0;
      KeyFlags const left{now.components & ~gone, (now.bridges & ~gone) | added, now.selected & ~gone};
      constexpr Values kAbsent{};
      gone ? leaf.write(slot, kAbsent.data(), gone, left) : leaf.setFlags(slot, left);
    }
    if (kind == Kind::Thin) lost += last, bridged += last;
    auto const left = static_cast<int>(kept.size());
    if (left == first) {
      leaf.erase(first, last);
    } else if (left < last) {
      for (int slot = last; slot < leaf.size(); ++slot) kept.push_back(slot);
      leaf.keep(kept.data(), static_cast<int>(kept.size()));
    } else {
      leaf.dropIdleFlags();
    }
  }
};

namespace {

// Versions that this thread may give out: threads take them by many at a time.
TALIX_THREAD_LOCAL uint64 t_version = 0;
TALIX_THREAD_LOCAL uint64 t_versionsEnd = 0;

}  // namespace

inline void KeyTrack::changed() {
  if (t_version == t_versionsEnd) {
    constexpr uint64 kAtATime = 1 << 16;
    static std::atomic<uint64> s_given = 1;  // 0 is that of new tracks and cursors
    t_version = s_given.fetch_add(kAtATime, std::memory_order_relaxed);
    t_versionsEnd = t_version + kAtATime;
  }
  m_version = t_version++;
}

// Keys that an edit put into a leaf; their flags are the same.
struct KeyTrack::Added {
  KeyNodeRef sibling{};  // the new leaf to the right, if any
  int keys = 1;
  KeyFlags flags{};
  bool replaces = false;  // one key that was there
  KeyFlags flagsBefore{};
};

// The way from the root to a leaf that is to be edited.
class KeyTrack::Path {
 public:
  // Goes down, taking the child that choose(inner) names, and makes the nodes the track's own on the way.
  // Ends at the leaf, which the caller makes its own where that is needed.
  template <class Choose>
  Path(KeyNodeRef& root, Choose choose) : m_leaf(&root) {
    while (!(*m_leaf)->isLeaf()) {
      m_leaf->own();
      auto& inner = asInner(*m_leaf->get());
      int const i = choose(inner);
      m_steps[m_size++] = {&inner, i};
      m_leaf = &inner.childRef(i);
    }
  }
  KeyNodeRef& leaf() { return *m_leaf; }

  // The inner nodes that a split of the leaf uses up, since full ones above it split as well, and when all
  // are full the track grows a root. To be made before anything changes, so that nothing can fail after that.
  void makeSpares(int fanout) {
    int needed = 0;
    while (needed < m_size && at(m_size - 1 - needed).inner->full()) ++needed;
    if (needed == m_size) ++needed;
    m_spares.reserve(static_cast<size_t>(needed));
    for (int level = needed; level > 0; --level) m_spares.emplace_back(new KeyInner(level, fanout));
  }
  // Brings the nodes above up to date after keys were added from a time on.
  void finishAdding(KeyNodeRef& root, int64 time, Added& added) noexcept {
    if (added.replaces && added.flags == added.flagsBefore) return;
    KeyNodeRef& sibling = added.sibling;
    for (int k = m_size - 1; k >= 0; --k) {
      auto const [inner, i] = at(k);
      inner->counts.count(added.flags, added.keys);
      if (added.replaces) inner->counts.count(added.flagsBefore, -1);
      inner->keysAdded(i, time);
      if (!sibling) continue;
      inner->counts -= sibling->counts;  // which the insertion adds
      sibling = inner->insert(i + 1, std::move(sibling), inner->full() ? takeSpare() : KeyNodeRef());
    }
    if (!sibling) return;
    KeyNodeRef grown = takeSpare();
    asInner(*grown.get()).insert(0, std::move(root), {});
    asInner(*grown.get()).insert(1, std::move(sibling), {});
    root = std::move(grown);
  }
  // The same after a key was edited; `before`: the leaf's counts. True when no key is left in the tree.
  bool finishEdit(KeyCounts const& before, bool erases) noexcept {
    KeyCounts gained = (*m_leaf)->counts;
    gained -= before;
    bool emptied = (*m_leaf)->counts.keys == 0, shrunk = erases;
    for (int k = m_size - 1; k >= 0; --k) {
      auto const [inner, i] = at(k);
      if (emptied) inner->childRef(i).reset();
      inner->childGained(i, gained);
      int const gone = emptied ? inner->closeGaps(i) : 0;
      // Only neighbours of one that has become smaller may fit one node now.
      shrunk = shrunk && (inner->join(i, i - gone, false) || gone > 0);
      emptied = inner->size() == 0;
    }
    return emptied;
  }

 private:
  static constexpr int kMaxDepth = 64;  // nodes have two children at least, or nearly so
  struct Step {
    KeyInner* inner;
    int child;
  };
  Step& at(int k) { return m_steps[static_cast<size_t>(k)]; }
  // From the lowest level up.
  KeyNodeRef takeSpare() noexcept {
    KeyNodeRef node = std::move(m_spares.back());
    m_spares.pop_back();
    return node;
  }

  std::array<Step, kMaxDepth> m_steps;  // the first m_size
  int m_size = 0;
  KeyNodeRef* m_leaf;
  std::vector<KeyNodeRef> m_spares;
};

void KeyTrack::set(int64 time, Values const& values, unsigned mask) {
  mask = normal(mask);
  if (mask == 0) return;
  put(time, values, {.components = mask, .bridges = bridgedAt(time, mask)});
}

// Adds the components to what the track holds at the time; components that it holds already keep their
// bridges.
void KeyTrack::put(int64 time, Values const& values, KeyFlags const& flags) {
  addKeys(time, [&](Path& path, Added& added) { setInLeaf(path, time, values, flags, added); });
}

// Lets addTo(path, added) add keys to the leaf that a time falls into, all or, when it throws, none. Before
// it splits the leaf it makes the spares for that.
template <class AddTo>
void KeyTrack::addKeys(int64 time, AddTo const& addTo) {
  changed();
  KeyNodeRef fresh = m_root ? KeyNodeRef() : KeyNodeRef(new KeyLeaf(width(), m_limits.leafKeys));
  KeyNodeRef& root = m_root ? m_root : fresh;
  Path path(root, [time](KeyInner const& inner) { return inner.childAtTime(time); });
  Added added;
  addTo(path, added);
  path.finishAdding(root, time, added);
  if (fresh) m_root = std::move(fresh);
}

void KeyTrack::setInLeaf(Path& path, int64 time, Values const& values, KeyFlags const& flags, Added& added) {
  KeyNodeRef& node = path.leaf();
  auto const insertInto = [&](KeyLeaf& leaf, int slot) {
    Values held{};
    for (size_t c = 0; c < held.size(); ++c)
      if (m_shape != Shape::Vector || flags.components >> c & 1) held[c] = values[c];
    leaf.insert(slot, time, held.data(), flags);
  };

  auto const& old = asLeaf(*node.get());
  int const size = old.size();
  int const slot = size == 0 ? 0 : old.lowerBound(time);
  bool const present = slot < size && old.time(slot) == time;
  if (present || !old.full()) {
    node.own();
    auto& leaf = asLeaf(*node.get());
    added.flags = flags;
    if (!present) return insertInto(leaf, slot);
    KeyFlags const held = added.flagsBefore = leaf.flags(slot);
    added.replaces = true;
    added.flags = {held.components | flags.components, held.bridges | (flags.bridges & ~held.components),
                   held.selected | flags.selected};
    leaf.write(slot, values.data(), flags.components, added.flags);
    return leaf.dropIdleFlags();
  }

  // Keys that arrive in order, from either end, leave full leaves behind; others halve them. The half that
  // the key goes to becomes a leaf of its own. Erasing an end of the other one needs no memory.
  path.makeSpares(m_limits.fanout);
  int const half = size / 2;
  bool const toLeft = slot <= half;
  int const first = slot == size ? size : toLeft ? 0 : half;
  int const last = slot == 0 ? 0 : toLeft ? half : size;
  auto* leaf = new KeyLeaf(width(), m_limits.leafKeys);
  KeyNodeRef fresh(leaf);
  if (first < last) {
    node.own();
    leaf->append(asLeaf(*node.get()), first, last);
  }
  insertInto(*leaf, slot - first);
  if (first < last) asLeaf(*node.get()).erase(first, last);
  if (toLeft) std::swap(node, fresh);
  added.flags = flags;
  added.sibling = std::move(fresh);
}

void KeyTrack::append(int64 start, int64 period, double const* values, int64 n) {
  if (n <= 0) return;
  assert((n == 1 || period > 0) && (empty() || start > timeAt(count() - 1)));
  while (n > 0) {
    int some = 0;
    addKeys(start, [&](Path& path, Added& added) {
      KeyNodeRef& node = path.leaf();
      bool const splits = asLeaf(*node.get()).full();
      some =
          static_cast<int>(std::min<int64>(n, m_limits.leafKeys - (splits ? 0 : asLeaf(*node.get()).size())));
      added.keys = some;
      if (splits) {
        path.makeSpares(m_limits.fanout);
        added.sibling = KeyNodeRef(new KeyLeaf(width(), m_limits.leafKeys));
      } else {
        node.own();
      }
      asLeaf(*(splits ? added.sibling : node).get()).append(start, period, values, some);
    });
    start += period * some;
    values += static_cast<int64>(some) * width();
    n -= some;
  }
}

int64 KeyTrack::edit(int64 firstIndex, int64 lastIndex, LeafEdit& what) {
  firstIndex = std::max<int64>(firstIndex, 0);
  lastIndex = std::min(lastIndex, count());
  if (firstIndex >= lastIndex || what.skips(*m_root.get())) return 0;
  changed();
  lastIndex - firstIndex == 1 ? editOne(firstIndex, what) : editBelow(m_root, firstIndex, lastIndex, what);
  while (m_root && !m_root->isLeaf() && asInner(*m_root.get()).size() == 1) {
    KeyNodeRef only = asInner(*m_root.get()).childRef(0);
    m_root = std::move(only);
  }
  return what.affected;
}

void KeyTrack::editOne(int64 index, LeafEdit& what) {
  Path path(m_root, [&index](KeyInner const& inner) { return inner.childAtIndex(index); });
  path.leaf().own();
  auto& leaf = asLeaf(*path.leaf().get());
  KeyCounts const before = leaf.counts;
  what.apply(leaf, static_cast<int>(index), static_cast<int>(index) + 1);
  if (path.finishEdit(before, what.erases())) m_root.reset();
}

// Edits the keys with the indices [first, last) of the node; a node that loses all of them becomes null. When
// it throws, some keys are edited and others are not, and the nodes are as whole as ever.
void KeyTrack::editBelow(KeyNodeRef& node, int64 first, int64 last, LeafEdit& what) {
  if (what.skips(*node.get())) return;
  if (what.dropsWhole() && first == 0 && last == node->counts.keys) {
    what.affected += last;
    node.reset();
    return;
  }
  if (what.dropsWhole() && node->isLeaf() && node->isShared() && (first == 0 || last == node->counts.keys)) {
    auto const& old = asLeaf(*node.get());
    bool const toRight = first == 0;
    auto const cut = static_cast<int>(toRight ? last : first);
    KeyNodeRef left(new KeyLeaf(old, toRight ? cut : 0, toRight ? old.size() : cut));
    asLeaf(*left.get()).pack();
    node = std::move(left);
    what.affected += last - first;
    return;
  }
  node.own();
  if (node->isLeaf()) {
    auto& leaf = asLeaf(*node.get());
    what.apply(leaf, static_cast<int>(first), static_cast<int>(last));
    if (leaf.size() == 0) {
      node.reset();
    } else if (what.erases()) {
      leaf.pack();
    }
    return;
  }

  auto& inner = asInner(*node.get());
  int64 from = first;
  int const firstChild = inner.childAtIndex(from);
  int64 before = first - from;
  int i = firstChild;
  for (; i < inner.size() && before < last; ++i) {
    int64 const keys = inner.keys(i);
    KeyNodeRef& child = inner.childRef(i);
    KeyCounts gained;
    gained -= child->counts;
    auto const finish = [&] {
      if (child) gained += child->counts;
      inner.childGained(i, gained);
    };
    try {
      editBelow(child, std::max<int64>(first - before, 0), std::min(last - before, keys), what);
    } catch (...) {
      finish();
      inner.closeGaps(firstChild);
      throw;
    }
    finish();
    before += keys;
  }
  if (what.erases()) inner.join(firstChild, i - 1 - inner.closeGaps(firstChild), true);
  if (inner.size() == 0) node.reset();
}

int64 KeyTrack::editTimes(int64 first, int64 last, LeafEdit& what) {
  return first > last ? 0 : edit(lowerBound(first), placeAtOrBefore(last).index + 1, what);
}

int64 KeyTrack::erase(int64 index, unsigned mask) {
  if (index < 0 || index >= count()) return 0;
  if (bridgesAny(mask)) {
    int64 const time = timeAt(index);
    return eraseRange(time, time, mask);
  }
  LeafEdit what{LeafEdit::Kind::Erase, normal(mask)};
  return edit(index, index + 1, what);
}

int64 KeyTrack::eraseRange(int64 first, int64 last, unsigned mask) {
  if (first > last) return 0;
  // Bridges into the range lose their end.
  int64 const from = bridgesAny(mask) ? lowerBound(first) : count();
  for (unsigned const part : KeyParts(m_shape, mask)) {
    Place const gone = placeAt(nextHolding(from - 1, part));
    if (!gone || gone.time() > last) continue;
    endBridge(previousHolding(from, part), part);
  }
  LeafEdit what{LeafEdit::Kind::Erase, normal(mask)};
  return editTimes(first, last, what);
}

void KeyTrack::endBridge(int64 index, unsigned part) {
  Place const place = placeAt(index);
  if (!place || !(place.bridges() & part)) return;
  LeafEdit end{LeafEdit::Kind::Unbridge, part};
  edit(index, index + 1, end);
}

// The keys at the ends are put before what lies between them is erased: so the bridges that stay go through
// them.
void KeyTrack::capBridges(int64 first, int64 last, unsigned mask, BridgeEnds const& ends,
                          KeyTrack const& curve) {
  first = std::max(first, -kForever), last = std::min(last, kForever);
  int64 const firstFrame = frameAtOrAfter(first, ends.framePeriod);
  int64 const lastFrame = frameAtOrBefore(last, ends.framePeriod);
  int64 const before = (firstFrame - 1) * ends.framePeriod, after = (lastFrame + 1) * ends.framePeriod;
  int64 const from = lowerBound(first), to = placeAtOrBefore(last).index + 1;
  unsigned endsBefore = 0, beginsAfter = 0, cut = 0;
  for (unsigned const part : KeyParts(m_shape, mask)) {
    Place const earlier = placeAt(previousHolding(from, part)), next = placeAt(nextHolding(from - 1, part));
    bool const holdsKeys = next && next.time() <= last;
    if (!holdsKeys && firstFrame > lastFrame) continue;
    if (earlier && earlier.bridges() & part) {
      cut |= part;
      if (earlier.time() < before) endsBefore |= part;
    }
    Place const inner = placeAt(previousHolding(to, part)), later = placeAt(nextHolding(to - 1, part));
    if (inner && later && inner.bridges() & part && later.time() > after) beginsAfter |= part;
  }
  auto const cap = [&](int64 time, unsigned components) {
    if (!components) return;
    Values values{};
    curve.evaluate(time, ends.interpolation, {}, values);
    set(time, values, components);
  };
  cap(before, endsBefore);
  cap(after, beginsAfter);
  for (unsigned const part : KeyParts(m_shape, cut))
    endBridge(previousHolding(lowerBound(first), part), part);
}

int64 KeyTrack::deleteRange(int64 first, int64 last, unsigned mask, BridgeEnds const& ends) {
  if (first > last) return 0;
  if (bridgesAny(mask)) capBridges(first, last, normal(mask), ends, KeyTrack(*this));
  return eraseRange(first, last, mask);
}

int64 KeyTrack::deleteSelected(unsigned mask, BridgeEnds const& ends) {
  mask = normal(mask);
  if (!bridgesAny(mask)) {
    LeafEdit what{LeafEdit::Kind::EraseSelected, mask};
    return edit(0, count(), what);
  }
  int64 const affected = countSelected(mask);
  KeyTrack const before = *this;
  for (unsigned const part : KeyParts(m_shape, mask)) {
    for (int64 first = before.nextSelected(-1, part), last; first >= 0;
         first = before.nextSelected(last, part)) {
      last = first;
      for (int64 next;
           (next = before.nextHolding(last, part)) >= 0 && before.placeAt(next).selected() & part;)
        last = next;
      int64 const start = before.timeAt(first), end = before.timeAt(last);
      if (bridgesAny(part)) capBridges(start, end, part, ends, before);
      eraseRange(start, end, part);
    }
  }
  return affected;
}

int64 KeyTrack::thin(std::vector<unsigned char> const& lost) {
  assert(static_cast<int64>(lost.size()) == count());
  // A key bridges a component when the next key that holds it loses it and a later one keeps it.
  std::vector<unsigned char> held, bridged(lost.size());
  held.reserve(lost.size());
  forEach(0, count(), [&](Key const& key) { held.push_back(key.components); });
  unsigned nextLoses = 0, laterKeeps = 0;
  for (size_t i = lost.size(); i-- > 0;) {
    unsigned const gone = lost[i] & held[i], kept = held[i] & ~gone;
    bridged[i] = static_cast<unsigned char>(kept & nextLoses & laterKeeps);
    nextLoses = (nextLoses & ~kept) | gone;
    laterKeeps |= kept;
  }
  LeafEdit what{LeafEdit::Kind::Thin, kAll};
  what.lost = lost.data();
  what.bridged = bridged.data();
  return edit(0, count(), what);
}

void KeyTrack::bridge(int64 first, int64 last, unsigned mask) {
  LeafEdit what{LeafEdit::Kind::Bridge, normal(mask)};
  editTimes(first, last, what);
  for (unsigned const part : KeyParts(m_shape, mask)) endBridge(previousHolding(count(), part), part);
}

void KeyTrack::unbridge(int64 first, int64 last, unsigned mask) {
  LeafEdit what{LeafEdit::Kind::Unbridge, normal(mask)};
  editTimes(first, last, what);
}

void KeyTrack::restore(Key const& key) {
  restoreNone(key.time);
  put(key.time, key.values, {key.components, key.bridges, key.selected});
}

void KeyTrack::restoreNone(int64 time) {
  LeafEdit what{LeafEdit::Kind::Erase, kAll};
  editTimes(time, time, what);
}

void KeyTrack::clear() {
  changed();
  m_root.reset();
}

int64 KeyTrack::select(int64 first, int64 last, unsigned mask) {
  LeafEdit what{LeafEdit::Kind::Select, normal(mask)};
  return editTimes(first, last, what);
}

int64 KeyTrack::deselect(int64 first, int64 last, unsigned mask) {
  LeafEdit what{LeafEdit::Kind::Deselect, normal(mask)};
  return editTimes(first, last, what);
}

void KeyTrack::setSelected(int64 index, unsigned flags) {
  Place const place = placeAt(index);
  unsigned const wanted = normal(flags) & place.leaf->components(place.slot);
  unsigned const now = place.leaf->selected(place.slot);
  if (unsigned const extra = now & ~wanted) {
    LeafEdit what{LeafEdit::Kind::Deselect, extra};
    edit(index, index + 1, what);
  }
  if (unsigned const missing = wanted & ~now) {
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
