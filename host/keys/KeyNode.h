// What the nodes of a key track's tree have in common: a reference count, a level and the counts of their
// keys. Nodes are shared between snapshots; only a node with a single reference may be changed
// (KeyNodeRef::own). The count is atomic: each thread may copy, read, drop and change tracks of its own
// whatever nodes they share.
#pragma once

#include <atomic>
#include <utility>
#if __has_include(<sys/single_threaded.h>)
#include <sys/single_threaded.h>
#endif

#include "host/base/Types.h"

// Bits of a key, by components: 1 x, 2 y, 4 z. Bridges and selection are part of the components.
struct KeyFlags {
  unsigned components = 7;
  unsigned bridges = 0;  // components whose data goes on to the next key that has them
  unsigned selected = 0;

  bool operator==(KeyFlags const&) const = default;
};

// What lies below a node, by components: x 0, y 1, z 2.
struct KeyCounts {
  int64 keys = 0;
  int64 whole = 0;           // keys that hold every component
  int64 selected = 0;        // keys selected on any component
  int64 held[3] = {};        // keys that hold the component
  int64 selectedOn[3] = {};  // keys selected on the component
  int64 bridging[3] = {};    // keys that bridge the component

  // `by` keys more with these flags, or less.
  void count(KeyFlags const& flags, int by) {
    if (flags == KeyFlags()) {
      keys += by, whole += by;
      for (int64& each : held) each += by;
      return;
    }
    keys += by;
    whole += flags.components == 7 ? by : 0;
    selected += flags.selected ? by : 0;
    for (int c = 0; c < 3; ++c) {
      held[c] += flags.components >> c & 1 ? by : 0;
      selectedOn[c] += flags.selected >> c & 1 ? by : 0;
      bridging[c] += flags.bridges >> c & 1 ? by : 0;
    }
  }

  void operator+=(KeyCounts const& o) {
    keys += o.keys, whole += o.whole, selected += o.selected;
    for (int c = 0; c < 3; ++c)
      held[c] += o.held[c], selectedOn[c] += o.selectedOn[c], bridging[c] += o.bridging[c];
  }
  void operator-=(KeyCounts const& o) {
    keys -= o.keys, whole -= o.whole, selected -= o.selected;
    for (int c = 0; c < 3; ++c)
      held[c] -= o.held[c], selectedOn[c] -= o.selectedOn[c], bridging[c] -= o.bridging[c];
  }
  bool operator==(KeyCounts const&) const = default;

  // Whether some key holds (is selected on, bridges) any component of the mask.
  bool holdsAny(unsigned mask) const { return anyOf(held, mask); }
  bool selectedAny(unsigned mask) const { return anyOf(selectedOn, mask); }
  bool bridgesAny(unsigned mask) const { return anyOf(bridging, mask); }
  // Whether every key is whole and bridges every component.
  bool bridgesAll() const {
    return whole == keys && bridging[0] == keys && bridging[1] == keys && bridging[2] == keys;
  }
  // Whether some key may be selected on no component of the mask; surely so with one component or all.
  bool unselectedAny(unsigned mask) const {
    if (mask == 7) return keys > selected;
    for (int c = 0; c < 3; ++c)
      if (mask >> c & 1 && selectedOn[c] == keys) return false;
    return keys > 0;
  }

 private:
  static bool anyOf(int64 const (&by)[3], unsigned mask) {
    return (mask & 1 && by[0]) || (mask & 2 && by[1]) || (mask & 4 && by[2]);
  }
};

class KeyNode {
 public:
  KeyCounts counts;

  bool isLeaf() const { return m_level == 0; }
  int level() const { return m_level; }  // 0 for leaves
  // Nobody else begins to share a node that has one reference, as that takes a reference. Acquires what
  // threads did that have dropped theirs, so that the node may be changed or destroyed.
  bool isShared() const { return m_references.load(std::memory_order_acquire) > 1; }

  KeyNode& operator=(KeyNode const&) = delete;

 protected:
  explicit KeyNode(int level) : m_level(level) {}
  KeyNode(KeyNode const& o) : counts(o.counts), m_level(o.m_level) {}
  ~KeyNode() = default;

 private:
  friend class KeyNodeRef;
  std::atomic<int> m_references = 0;
  int m_level;
};

// One reference to a node, or none.
class KeyNodeRef {
 public:
  KeyNodeRef() = default;
  explicit KeyNodeRef(KeyNode* node) : m_node(node) { hold(); }
  KeyNodeRef(KeyNodeRef const& o) : m_node(o.m_node) { hold(); }
  KeyNodeRef(KeyNodeRef&& o) noexcept : m_node(std::exchange(o.m_node, nullptr)) {}
  KeyNodeRef& operator=(KeyNodeRef o) noexcept {
    std::swap(m_node, o.m_node);
    return *this;
  }
  ~KeyNodeRef() {
    if (m_node) letGo();
  }

  KeyNode* get() const { return m_node; }
  KeyNode* operator->() const { return m_node; }
  explicit operator bool() const { return m_node != nullptr; }
  bool operator==(KeyNodeRef const&) const = default;

  void reset() { *this = KeyNodeRef(); }

  // Replaces a node that others share by a copy, so that it may be changed.
  void own() {
    if (m_node->isShared()) *this = KeyNodeRef(clone(*m_node));
  }

 private:
  // Without other threads there is nobody to lock out, and copies of inner nodes count many references.
  static bool isAlone() {
#if __has_include(<sys/single_threaded.h>)
    return __libc_single_threaded;
#else
    return false;
#endif
  }
  void hold() {
    if (!m_node) return;
    std::atomic<int>& count = m_node->m_references;
    if (isAlone()) return count.store(count.load(std::memory_order_relaxed) + 1, std::memory_order_relaxed);
    count.fetch_add(1, std::memory_order_relaxed);
  }
  void letGo() {
    std::atomic<int>& count = m_node->m_references;
    if (!m_node->isShared()) return destroy(m_node);
    if (isAlone()) return count.store(count.load(std::memory_order_relaxed) - 1, std::memory_order_relaxed);
    if (count.fetch_sub(1, std::memory_order_acq_rel) == 1) destroy(m_node);
  }
  static void destroy(KeyNode*);
  static KeyNode* clone(KeyNode const&);

  KeyNode* m_node = nullptr;
};
