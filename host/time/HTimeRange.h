// A range of ticks [start, end], both included. Empty when start is after end.
#pragma once

#include "host/time/Ticks.h"

class HTimeRange {
 public:
  HTimeRange() = default;  // empty
  HTimeRange(int64 start, int64 end) : m_start(start), m_end(end) {}

  // The whole time line: -(2^62 - 1) to 2^62 - 1.
  static HTimeRange const& forever();

  int64 getStart() const { return m_start; }
  int64 getEnd() const { return m_end; }
  bool isEmpty() const { return m_start > m_end; }
  bool contains(int64 time) const { return m_start <= time && time <= m_end; }
  void setEnds(int64 start, int64 end) { m_start = start, m_end = end; }

  // The smallest range that holds both; an empty range adds nothing.
  void include(HTimeRange other);
  void include(int64 time) { include(HTimeRange(time, time)); }
  void intersect(HTimeRange other);

  bool operator==(HTimeRange const&) const = default;

 private:
  int64 m_start = 1;
  int64 m_end = -1;
};
