#include "host/time/HTimeRange.h"

#include <algorithm>

HTimeRange const& HTimeRange::forever() {
  static HTimeRange const whole(-kForever, kForever);
  return whole;
}

void HTimeRange::include(HTimeRange other) {
  if (other.isEmpty()) return;
  if (isEmpty()) {
    *this = other;
    return;
  }
  m_start = std::min(m_start, other.m_start);
  m_end = std::max(m_end, other.m_end);
}

void HTimeRange::intersect(HTimeRange other) {
  m_start = std::max(m_start, other.m_start);
  m_end = std::min(m_end, other.m_end);
}
