// The keys of one channel in one clip and layer, sorted by time: a counted, copy-on-write B+-tree.
//
// Invariants (checkInvariants tests these, in this order):
//  1. Key times strictly ascend.
//  2. A key holds at least one component; a rotation or one-valued key always holds all.
//  3. The counts in inner nodes (keys, selected keys by component, keys by component) are those of their leaves.
//  4. Leaves are dense (evenly spaced, every key whole, none selected) or general; no leaf is empty.
//
// Copying a track is a snapshot and costs one reference; the copies part at the first change of either.
// Unless a comment says otherwise an operation is logarithmic in the number of keys, plus one leaf.
// Times are ticks. Masks: 1 x, 2 y, 4 z, 7 all; one-valued and rotation tracks know only "all" (any non-zero
// mask). A key is whole when it holds every component.
#pragma once

#include <array>
#include <memory>
#include <vector>

#include "host/base/Types.h"

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
  };

  // Remembers where the last evaluation was, so that playing forward costs constant time. Belongs to the caller;
  // a cursor of another or a changed track only costs a search.
  struct Cursor {
    const void* leaf = nullptr;
    int64 firstIndex = 0;  // of the leaf
    int slot = 0;
    uint64 version = 0;
  };

  explicit KeyTrack(Shape shape);
  KeyTrack(KeyTrack const&);
  KeyTrack(KeyTrack&&) noexcept;
  KeyTrack& operator=(KeyTrack const&);
  KeyTrack& operator=(KeyTrack&&) noexcept;
  ~KeyTrack();

  Shape shape() const;
  int width() const;  // doubles in a key: 1, 3 or 4

  // Counts, constant time. With a mask: keys that hold (are selected on) all of, or any of, its components.
  int64 count() const;
  int64 countHolding(unsigned mask) const;  // one component or all: constant; two components: linear
  int64 countSelected() const;
  int64 countSelected(unsigned mask) const;  // any bit shared; one component or all: constant
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

  // Writes the components of `mask` at `time`. An existing key keeps its selection and other components.
  // Appending at the end is amortised constant.
  void set(int64 time, Values const& values, unsigned mask = kAll);
  // Appends `n` whole keys at start, start + period, ... (after the last key); `values` holds n * width() doubles.
  void append(int64 start, int64 period, const double* values, int64 n);

  // Erasing on a mask removes these components; a key left without any goes. They answer the number of keys that
  // lost something. Ranges include both ends; the cost of a range is that of the leaves it touches.
  int64 erase(int64 index, unsigned mask = kAll);
  int64 eraseRange(int64 first, int64 last, unsigned mask = kAll);
  int64 eraseSelected(unsigned mask = kAll);
  void clear();

  // Selection. Only components that a key holds can be selected. Each answers the number of keys whose flags on
  // the mask are now set (cleared).
  int64 select(int64 first, int64 last, unsigned mask = kAll);
  int64 deselect(int64 first, int64 last, unsigned mask = kAll);
  void setSelected(int64 index, unsigned flags);

  // The value at a time, into values[0 .. width() - 1]. Before the first and after the last key the value holds.
  // Each component comes from the keys that hold it; `defaults` fills one that no key holds (and all, when the
  // track is empty). A null cursor searches.
  void evaluate(int64 time, Interpolation, Values const& defaults, Values& values, Cursor* = nullptr) const;
  double evaluateComponent(int64 time, Interpolation, int component, double byDefault, Cursor* = nullptr) const;

  // Calls visit(Key const&) for the keys first to last index (excluding last), in order.
  template <class Visit>
  void forEach(int64 firstIndex, int64 lastIndex, Visit visit) const {
    Reader reader(*this, firstIndex);
    for (int64 i = firstIndex; i < lastIndex; ++i) visit(reader.next());
  }

  // Reads keys one after the other in constant time each. The track must not change meanwhile.
  class Reader {
   public:
    Reader(KeyTrack const&, int64 firstIndex);
    ~Reader();
    Key next();

   private:
    struct State;
    std::unique_ptr<State> m_state;
  };

  // Replaces every whole key's values by change(values); times, flags and selection stay. For unit, axis and sign
  // changes of a whole channel.
  template <class Change>
  void transform(Change change) {
    transformLeaves([](void* context, double* values) { (*static_cast<Change*>(context))(values); }, &change);
  }

  // Same keys, flags and selection (not: same leaves).
  bool operator==(KeyTrack const&) const;
  // Shares all leaves with the other: nothing was changed since one was copied from the other.
  bool sharesAll(KeyTrack const&) const;

  // Bytes held, shared leaves counted in full.
  int64 memoryUse() const;
  // Tests the invariants; the text of the first broken one, empty when all hold.
  const char* checkInvariants() const;

 private:
  void transformLeaves(void (*change)(void*, double*), void* context);
  struct Impl;
  std::unique_ptr<Impl> m_impl;  // null: an empty vector of no keys
  Shape m_shape;
};
