// Where one track has data, frame by frame: what was measured, and its gaps.
//
// A frame has data in a component when a key lies on it or a bridge passes over it. Keys between frames that
// bridge nothing are data at no frame. Whole frames lie at the multiples of a period; all ranges here start
// and end at frames.
//
// Cost: logarithmic to get to a time. From there leaves with a key at each frame and stretches of bridged
// keys are passed in one step, other keys one by one. The track must outlive the object and stay as it is
// meanwhile.
#pragma once

#include "host/keys/KeyTrack.h"
#include "host/time/HTimeRange.h"

class DataRanges {
 public:
  // Which frames count: those where any component of the mask has data, or where all have. So a frame of a
  // gap is one where no component has data, or one where any lacks it.
  enum class Where : unsigned char { Any, All };

  DataRanges(KeyTrack const& track, int64 framePeriod, unsigned mask = KeyTrack::kAll,
             Where where = Where::Any);

  // At any time, not only at frames.
  bool hasDataAt(int64 time) const;

  // The whole run of frames with data around the time of a frame; empty when it has none.
  HTimeRange rangeAround(int64 frameTime) const;
  // The next run of frames with (without) data that has a frame in [first, last], cut to it; empty when there
  // is none. The frames before the first and after the last key of a track are a gap.
  HTimeRange nextRange(int64 first, int64 last) const;
  HTimeRange nextGap(int64 first, int64 last) const;

  // Calls visit(start, end) for each run of frames with (without) data in [first, last], cut to it, in order.
  template <class Visit>
  void visitRanges(int64 first, int64 last, Visit visit) const {
    scan(
        first, last,
        [](void* context, int64 start, int64 end) {
          (*static_cast<Visit*>(context))(start, end);
          return true;
        },
        &visit);
  }
  template <class Visit>
  void visitGaps(int64 first, int64 last, Visit visit) const {
    int64 next = frameAtOrAfter(first, m_period) * m_period;
    visitRanges(first, last, [&](int64 start, int64 end) {
      if (start > next) visit(next, start - m_period);
      next = end + m_period;
    });
    int64 const end = frameAtOrBefore(last, m_period) * m_period;
    if (next <= end) visit(next, end);
  }

  // Lets the keys of a track, mostly another one, bridge these components within each run of frames with
  // data.
  void bridge(KeyTrack& track, unsigned mask = KeyTrack::kAll) const;
  // The same for all components and at all times where keys of `data` bridge.
  static void bridgeAlike(KeyTrack& track, KeyTrack const& data);

 private:
  struct Scan;
  using Emit = bool (*)(void* context, int64 start, int64 end);  // false: no more

  bool counts(unsigned components) const {
    components &= m_mask;
    return m_where == Where::Any ? components != 0 : components == m_mask;
  }
  void scan(int64 first, int64 last, Emit emit, void* context) const;

  KeyTrack const& m_track;
  int64 m_period;
  unsigned m_mask;
  Where m_where;
};
