// The ascending times at which a track is sampled: evenly spaced, or a list that the caller keeps.
#pragma once

#include <algorithm>
#include <cassert>
#include <span>

#include "host/base/Types.h"

class SampleTimes {
 public:
  SampleTimes(int64 start, int64 period, int64 count) : m_start(start), m_period(period), m_count(count) {
    assert(count <= 1 || period > 0);
  }
  explicit SampleTimes(std::span<int64 const> times)
      : m_list(times.data()), m_count(static_cast<int64>(times.size())) {
    assert(std::is_sorted(times.begin(), times.end()));
  }

  int64 count() const { return m_count; }
  int64 period() const { return m_period; }  // 0: a list
  int64 operator[](int64 i) const { return m_list ? m_list[i] : spaced(i); }

  // The index of the first one at or after `time`, not before index `from`; count() when there is none.
  int64 lowerBound(int64 time, int64 from) const {
    if (m_list) return std::lower_bound(m_list + from, m_list + m_count, time) - m_list;
    if (from >= m_count || (*this)[from] >= time) return from;
    // Times of either end of the time line are farther apart than a signed number holds.
    uint64 const apart = static_cast<uint64>(time) - static_cast<uint64>((*this)[from]);
    uint64 const steps = m_period > 0 ? (apart - 1) / static_cast<uint64>(m_period) + 1 : 1;
    return steps < static_cast<uint64>(m_count - from) ? from + static_cast<int64>(steps) : m_count;
  }

  // `count` of them from index `from` on.
  SampleTimes part(int64 from, int64 count) const {
    return m_list ? SampleTimes({m_list + from, static_cast<size_t>(count)})
                  : SampleTimes(m_start + m_period * from, m_period, count);
  }

  void read(int64 from, int n, int64* out) const {
    if (m_list) {
      std::copy_n(m_list + from, n, out);
    } else {
      for (int i = 0; i < n; ++i) out[i] = spaced(from + i);
    }
  }

 private:
  // Unsigned, since the whole time line is longer than a signed number holds.
  int64 spaced(int64 i) const {
    return static_cast<int64>(static_cast<uint64>(m_start) +
                              static_cast<uint64>(m_period) * static_cast<uint64>(i));
  }

  int64 const* m_list = nullptr;
  int64 m_start = 0, m_period = 0;
  int64 m_count = 0;
};
