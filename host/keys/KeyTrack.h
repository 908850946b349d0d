// The keys of one channel in one clip and layer, sorted by time: a counted, copy-on-write B+-tree.
//
// Invariants (checkInvariants tests these, in this order):
//  1. Key times strictly ascend.
//  2. A key holds at least one component; a rotation or one-valued key always holds all.
//  3. A key bridges only components that it holds and that a later key holds, too; a rotation or one-valued
//  key all or none.
//  4. The counts in inner nodes (keys; keys, selected keys and bridges by component) are those of their
//  leaves.
//  5. No leaf is empty; what a leaf stores in a compact form has it: even times (a start and a period) or
//  offsets (LeafTimes.h), no flags (every key whole, nothing bridged), no selection, equal values stored
//  once, values stored as floats without loss.
//
// Bridges tell where there is data between keys (DataRanges.h): a key that bridges a component goes on to the
// next key that has it. Values between keys do not depend on them.
//
// Copying a track is a snapshot and costs one reference; the copies part at the first change of either.
// Unless a comment says otherwise an operation is logarithmic in the number of keys, plus one leaf.
//
// Where memory runs out, set() leaves the track as it was; other edits may have changed some of their keys,
// but for bridges (3) the invariants hold. Times are ticks. Masks: 1 x, 2 y, 4 z, 7 all; one-valued and
// rotation tracks know only "all" (any non-zero mask). A key is whole when it holds every component.
#pragma once

#include <array>
#include <cstddef>
#include <vector>

#include "host/base/Types.h"
#include "host/keys/KeyNode.h"

class KeyLeaf;
class SampleTimes;

enum class Interpolation : unsigned char {
  Constant,  // the last key at or before the time
  Linear,    // straight line; rotations: slerp along the shorter arc
  Cubic      // Catmull-Rom over uneven times, one-sided at the ends, neighbours only; rotations: squad
};

class KeyTrack {
 public:
  enum class Shape : unsigned char {
    Scalar = 1,   // one double
    Vector = 3,   // three doubles, each may be keyed alone
    Rotation = 4  // unit quaternion x y z w, keyed whole
  };
  static constexpr unsigned kAll = 7;

  using Values = std::array<double, 4>;  // the first 1, 3 or 4 count

  struct Key {
    int64 time = 0;
    Values values{};
    unsigned char components = kAll;  // which components are keyed
    unsigned char selected = 0;       // selection flags; all three bits on one-valued and rotation keys
    unsigned char bridges = 0;        // components whose data goes on to the next key that has them
  };

  // How a deletion finds the frames at which bridges then end, and the values there.
  struct BridgeEnds {
    Interpolation interpolation = Interpolation::Linear;
    int64 framePeriod = 1;  // ticks; whole frames lie at its multiples
  };

  // Remembers where the last evaluation was, so that playing forward costs constant time. Belongs to the
  // caller; a cursor of another or a changed track only costs a search.
  struct Cursor {
    KeyLeaf const* leaf = nullptr;  // valid only while the version is the track's
    KeyLeaf const* next = nullptr;  // the next leaf, null after the last
    int64 firstIndex = 0;           // of the leaf
    int slot = 0;
    uint64 version = 0;
  };

  // Sizes of the tree's nodes. Small ones make deep trees of few keys, which is what tests want.
  struct Limits {
    int leafKeys = 256;  // at least 4
    int fanout = 32;     // 4 to 32
  };

  explicit KeyTrack(Shape shape);
  KeyTrack(Shape shape, Limits limits);

  Shape shape() const { return m_shape; }
  int width() const { return static_cast<int>(m_shape); }  // doubles in a key: 1, 3 or 4

  // Counts, constant time. With a mask: keys that hold all of (are selected on any of) its components.
  // Mask 0 counts every key (no key).
  int64 count() const { return m_root ? m_root->counts.keys : 0; }
  int64 countHolding(unsigned mask) const;  // all of; one component or all: constant; two components: linear
  int64 countSelected() const { return m_root ? m_root->counts.selected : 0; }
  int64 countSelected(unsigned mask) const;  // any of; one component or all: constant; two: linear
  bool empty() const { return count() == 0; }

  // By index. The index must lie in the track.
  Key at(int64 index) const;
  int64 timeAt(int64 index) const;
  int64 selectedIndex(int64 i) const;  // index of the i-th selected key

  // By time. -1: no such key.
  int64 find(int64 time) const;        // the key exactly at `time`
  int64 lowerBound(int64 time) const;  // the first key at or after `time`; count() when there is none
  // The next key after (before) index that holds (is selected on) any component of the mask; start with -1
  // (count()). -1 when there is none.
  int64 nextHolding(int64 index, unsigned mask) const;
  int64 previousHolding(int64 index, unsigned mask) const;
  int64 nextSelected(int64 index, unsigned mask) const;
  int64 previousSelected(int64 index, unsigned mask) const;
  // The same for keys that are selected on no component of the mask; linear for two components.
  int64 nextUnselected(int64 index, unsigned mask) const;
  int64 previousUnselected(int64 index, unsigned mask) const;

  // Writes the components of `mask` at `time`. An existing key keeps its selection and other components. On a
  // bridge the key bridges to both sides. Appending at the end is amortised constant.
  void set(int64 time, Values const& values, unsigned mask = kAll);
  // Appends `n` whole keys at start, start + period, ... (after the last key); `values` holds n * width()
  // doubles.
  void append(int64 start, int64 period, double const* values, int64 n);

  // Erasing on a mask removes these components; a key left without any goes, and a bridge that loses one of
  // its two keys goes whole. They return the number of keys that lost something. Ranges include both ends;
  // the cost of a range is that of the leaves it touches.
  int64 erase(int64 index, unsigned mask = kAll);  // an index outside the track erases nothing
  int64 eraseRange(int64 first, int64 last, unsigned mask = kAll);
  void clear();

  // The same for edits by a user, which take away no other data than what was chosen: a bridge that loses a
  // key, or frames, ends at the last frame before what is gone, or begins at the first one after it, where a
  // key with the curve's value is put. These keys are not counted. A range is all its frames, with or without
  // keys; of selected keys the components of the mask that are selected go, and the bridges between
  // neighbours that go.
  int64 deleteRange(int64 first, int64 last, unsigned mask, BridgeEnds const& ends);
  int64 deleteSelected(unsigned mask, BridgeEnds const& ends);

  // Takes out of each key, by index, these components; what is left bridges over them, so that no data is
  // lost. The last key that holds a component must keep it. Returns the number of keys that lost something.
  int64 thin(std::vector<unsigned char> const& lost);

  // Bridges. Whether any key bridges a component of the mask; constant time.
  bool bridgesAny(unsigned mask = kAll) const { return m_root && m_root->counts.bridgesAny(normal(mask)); }
  // The components of the mask that have data at the time because a bridge passes over it or reaches it.
  unsigned bridgedAt(int64 time, unsigned mask = kAll) const;
  // Lets the keys from first to last (times, included) bridge the components of the mask that they hold to
  // their next keys; the last key that holds a component never does. unbridge ends their bridges.
  void bridge(int64 first, int64 last, unsigned mask = kAll);
  void unbridge(int64 first, int64 last, unsigned mask = kAll);

  // Makes the track hold exactly this key at its time, or none, whatever the neighbours' bridges say: for
  // undo, which restores every key that an edit changed.
  void restore(Key const& key);
  void restoreNone(int64 time);

  // Selection. Only components that a key holds can be selected. Selecting returns the number of
  // keys in the range that hold a component of the mask; deselecting the number of keys that lost a flag.
  int64 select(int64 first, int64 last, unsigned mask = kAll);
  int64 deselect(int64 first, int64 last, unsigned mask = kAll);
  void setSelected(int64 index, unsigned flags);

  // The value at a time, into values[0 .. width() - 1]. Before the first and after the last key the value
  // holds. Each component comes from the keys that hold it; `defaults` fills one that no key holds (and all,
  // when the track is empty). A null cursor searches.
  void evaluate(int64 time, Interpolation, Values const& defaults, Values& values, Cursor* = nullptr) const;
  double evaluateComponent(int64 time, Interpolation, int component, double byDefault,
                           Cursor* = nullptr) const;

  // Evaluates at many times, leaf by leaf: component c of sample i goes to out[i * stride + c], for the
  // components of the mask; others are not touched. Equals evaluate() within 1e-12 of the values. Keeps
  // nothing in the track, so that several threads may sample one that does not change.
  void sample(SampleTimes const&, Interpolation, Values const& defaults, unsigned mask, double* out,
              ptrdiff_t stride) const;

  // Calls visit(Key const&) for the keys first to last index (excluding last), in order.
  template <class Visit>
  void forEach(int64 firstIndex, int64 lastIndex, Visit visit) const {
    Reader reader(*this, firstIndex);
    for (int64 i = firstIndex; i < lastIndex; ++i) visit(reader.next());
  }

  // Reads keys one after the other in constant time each. The track must not change meanwhile.
  class Reader {
   public:
    Reader(KeyTrack const& track, int64 firstIndex) : m_track(track), m_index(firstIndex) {}
    Key next();

   private:
    KeyTrack const& m_track;
    KeyLeaf const* m_leaf = nullptr;  // of the next key; null: to be searched
    int64 m_index;
    int m_slot = 0;
  };

  // Replaces every whole key's values by change(values); times, flags and selection stay. For unit, axis and
  // sign changes of a whole channel: keys with equal values may share one call.
  template <class Change>
  void transform(Change change) {
    transformLeaves([](void* context, double* values) { (*static_cast<Change*>(context))(values); }, &change);
  }

  // Same keys, flags and selection (not: same leaves).
  bool operator==(KeyTrack const&) const;
  // Shares all leaves with the other: nothing was changed since one was copied from the other.
  bool sharesAll(KeyTrack const&) const;

  // The tree, for those who compare tracks leaf by leaf; null without keys.
  KeyNode const* root() const { return m_root.get(); }

  // Bytes held, shared leaves counted in full.
  int64 memoryUse() const;
  // Bytes held that no other track shares.
  int64 memoryAlone() const;
  // Tests the invariants; the text of the first broken one, empty when all hold.
  char const* checkInvariants() const;

 private:
  friend class DataRanges;
  struct Place;     // a key: its leaf, slot and index
  struct LeafEdit;  // what a range edit does to the leaves that it touches
  class Sampler;    // sample() on one curve: all components, or one that is keyed alone
  class Path;       // from the root to a leaf
  struct Added;     // what came into a leaf

  unsigned normal(unsigned mask) const { return m_shape == Shape::Vector ? mask & kAll : mask ? kAll : 0; }
  void changed();
  void transformLeaves(void (*change)(void*, double*), void* context);

  Place placeAt(int64 index) const;
  Place placeAtOrBefore(int64 time) const;
  Place placeAtOrBefore(int64 time, Cursor&) const;
  Place neighbour(Place const&, int step, unsigned mask, Cursor const*) const;
  void evaluateAt(int64 time, Interpolation, unsigned mask, Place const& base, Values const& defaults,
                  Values& values, Cursor const*) const;

  void put(int64 time, Values const& values, KeyFlags const& flags);
  template <class AddTo>
  void addKeys(int64 time, AddTo const& addTo);
  void setInLeaf(Path& path, int64 time, Values const& values, KeyFlags const& flags, Added& added);
  int64 edit(int64 firstIndex, int64 lastIndex, LeafEdit&);
  int64 editTimes(int64 first, int64 last, LeafEdit&);
  void editOne(int64 index, LeafEdit&);
  void editBelow(KeyNodeRef& node, int64 first, int64 last, LeafEdit&);
  void endBridge(int64 index, unsigned part);  // -1: no key
  // What deleteRange does with the keys that are put at the ends of bridges, with values of `curve`.
  void capBridges(int64 first, int64 last, unsigned mask, BridgeEnds const& ends, KeyTrack const& curve);

  KeyNodeRef m_root;     // null: no keys
  uint64 m_version = 0;  // differs after every change, from that of any other track too
  Limits m_limits;
  Shape m_shape;
};
