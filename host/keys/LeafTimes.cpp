#include "host/keys/LeafTimes.h"

#include <algorithm>
#include <limits>
#include <numeric>
#include <vector>

constexpr int64 kMostMissing = std::numeric_limits<unsigned char>::max();

// With Even the slot, with Full the time.
int64 LeafTimes::storedOffset(int slot) const {
  return m_form == Form::Even      ? slot
         : m_form == Form::Thinned ? slot + missing()[slot]
         : m_form == Form::Short   ? stored<Short>(slot)
         : m_form == Form::Long    ? stored<Long>(slot)
                                   : stored<Full>(slot);
}

// How many offsets lie before the value. Halves without branches, which could not be predicted.
template <class OffsetAt, class T>
int LeafTimes::countBefore(OffsetAt offsetAt, T value) const {
  int from = 0, n = m_size;
  for (; n > 1; n -= n / 2) from += offsetAt(from + n / 2 - 1) < value ? n / 2 : 0;
  return from + (n == 1 && offsetAt(from) < value);
}

// The units, or with Full the time, must not be more than is stored.
int LeafTimes::countBefore(int64 units) const {
  switch (m_form) {
    case Form::Even:
      return static_cast<int>(units);
    case Form::Thinned:
      return countBefore([all = missing()](int i) { return i + all[i]; }, static_cast<int>(units));
    case Form::Short:
      return countBefore([this](int i) { return stored<Short>(i); }, static_cast<Short>(units));
    case Form::Long:
      return countBefore([this](int i) { return stored<Long>(i); }, static_cast<Long>(units));
    case Form::Full:
      break;
  }
  return countBefore([this](int i) { return stored<Full>(i); }, units);
}

int LeafTimes::lowerBound(int64 time) const {
  if (time > back()) return m_size;
  if (time <= front()) return 0;
  return countBefore(m_form == Form::Full ? time : (time - m_start - 1) / m_unit + 1);
}

int LeafTimes::lastAtOrBefore(int64 time) const {
  if (time >= back()) return m_size - 1;
  return countBefore(m_form == Form::Full ? time + 1 : (time - m_start) / m_unit + 1) - 1;
}

void LeafTimes::read(int slot, int n, int64* out) const {
  auto const decode = [&](auto offsetAt) {
    for (int i = 0; i < n; ++i) out[i] = m_start + m_unit * offsetAt(slot + i);
  };
  switch (m_form) {
    case Form::Even:
      return decode([](int i) { return i; });
    case Form::Thinned:
      return decode([all = missing()](int i) { return i + all[i]; });
    case Form::Short:
      return decode([this](int i) { return stored<Short>(i); });
    case Form::Long:
      return decode([this](int i) { return stored<Long>(i); });
    case Form::Full:
      for (int i = 0; i < n; ++i) out[i] = stored<Full>(slot + i);
  }
}

LeafTimes::Form LeafTimes::smallestFor(uint64 units) {
  return units <= std::numeric_limits<Short>::max()  ? Form::Short
         : units <= std::numeric_limits<Long>::max() ? Form::Long
                                                     : Form::Full;
}

// Takes n times at a slot of even ones when all are even then.
bool LeafTimes::continueEvenly(int slot, int64 start, int64 period, int n) {
  if (m_form != Form::Even) return false;
  if (m_size == 0) {
    m_start = start;
    m_unit = n > 1 ? period : 0;
  } else if (n > 1) {
    if (slot != m_size || start - back() != period || (m_size > 1 && m_unit != period)) return false;
    m_unit = period;
  } else if (m_size == 1) {
    m_unit = slot == 1 ? start - m_start : m_start - start;
    m_start = std::min(m_start, start);
  } else if (slot == m_size) {
    if (start - back() != m_unit) return false;
  } else {
    if (slot != 0 || m_start - start != m_unit) return false;
    m_start = start;
  }
  m_size += n;
  return true;
}

// Whether the form can hold the time wherever it comes.
bool LeafTimes::holds(int64 time) const {
  if (m_form == Form::Full) return true;
  if (m_form == Form::Even || m_form == Form::Thinned) return false;
  auto const apart = static_cast<uint64>(time - m_start), unit = static_cast<uint64>(m_unit);
  if (time < m_start || apart % unit != 0) return false;
  return apart / unit <=
         (m_form == Form::Short ? std::numeric_limits<Short>::max() : std::numeric_limits<Long>::max());
}

// Makes the form one that can hold n further times, at either end or, when it is one, between.
void LeafTimes::makeHold(int64 start, int64 period, int n) {
  int64 const end = start + period * (n - 1);
  if (holds(start) && (n == 1 || (period % unit() == 0 && holds(end)))) return;
  if (m_form == Form::Full) return;
  int64 const first = m_size > 0 ? std::min(front(), start) : start,
              last = m_size > 0 ? std::max(back(), end) : end;
  int64 divisor = std::gcd(m_unit, n > 1 ? period : 0);
  if (m_size > 0) divisor = std::gcd(divisor, start - front());
  convert(smallestFor(static_cast<uint64>(last - first) / static_cast<uint64>(divisor)), first, divisor);
}

// The new unit must divide the distance of each time from the new start.
void LeafTimes::convert(Form form, int64 start, int64 unit) {
  LeafTimes fresh;
  fresh.m_form = form;
  fresh.m_start = start;
  fresh.m_unit = unit;
  // Offsets in a multiple of the new unit need no division.
  bool const scales = m_form != Form::Full && form != Form::Full && m_unit % unit == 0;
  int64 const shift = scales ? (m_start - start) / unit : 0, scale = scales ? m_unit / unit : 0;
  auto const write = [&]<class T>(T) {
    int const words = static_cast<int>(sizeof(T) / sizeof(Short));
    fresh.m_column.open(0, m_size * words, m_size * words);
    for (int i = 0; i < m_size; ++i) {
      int64 const offset = form == Form::Full ? (*this)[i]
                           : scales           ? shift + scale * storedOffset(i)
                                              : ((*this)[i] - start) / unit;
      fresh.store(i, static_cast<T>(offset));
    }
  };
  if (form == Form::Short) write(Short{});
  if (form == Form::Long) write(Long{});
  if (form == Form::Full) write(Full{});
  fresh.m_size = m_size;
  *this = std::move(fresh);
}

// The form must hold them.
void LeafTimes::put(int slot, int64 start, int64 period, int n, int limit) {
  m_column.open(slot * words(), n * words(), limit * words());
  int64 const first = (start - base()) / unit(), step = period / unit();
  if (m_form == Form::Short) storeRun<Short>(slot, first, step, n);
  if (m_form == Form::Long) storeRun<Long>(slot, first, step, n);
  if (m_form == Form::Full) storeRun<Full>(slot, first, step, n);
  m_size += n;
  evenOut();
}

void LeafTimes::insert(int slot, int64 time, int limit) { add(slot, time, 0, 1, limit); }

void LeafTimes::append(int64 start, int64 period, int n, int limit) { add(m_size, start, period, n, limit); }

void LeafTimes::add(int slot, int64 start, int64 period, int n, int limit) {
  if (continueEvenly(slot, start, period, n)) return;
  makeHold(start, period, n);
  put(slot, start, period, n, limit);
}

void LeafTimes::append(LeafTimes const& from, int first, int last) {
  if (first == last) return;
  int const limit = m_size + last - first;
  if (from.even()) return append(from[first], from.m_unit, last - first, limit);
  int const before = m_size;
  try {
    for (int slot = first; slot < last; ++slot) append(from[slot], 0, 1, limit);
  } catch (...) {
    erase(before, m_size);
    throw;
  }
}

void LeafTimes::erase(int first, int last) {
  if (even()) {
    if (last == m_size || first == 0) {
      if (first == 0) m_start += m_unit * last;
      m_size -= last - first;
      if (m_size < 2) m_unit = 0;
      return;
    }
  }
  if (m_form == Form::Thinned && eraseThinned(first, last)) return;
  if (m_form <= Form::Thinned)
    convert(smallestFor(static_cast<uint64>(storedOffset(m_size - 1))), m_start, m_unit);
  m_column.erase(words(first), words(last));
  m_size -= last - first;
  evenOut();
}

// The times keep their form when they can; at an end they do.
bool LeafTimes::eraseThinned(int first, int last) {
  int const gone = last - first, left = m_size - gone;
  unsigned char* const all = missing();
  if (first > 0 && last < m_size && all[m_size - 1] + gone > kMostMissing) return false;
  if (last < m_size) {
    int const more = first > 0 ? gone : -all[last];
    if (first == 0) m_start = (*this)[last];
    for (int slot = first; slot < left; ++slot)
      all[slot] = static_cast<unsigned char>(all[slot + gone] + more);
  }
  m_column.erase(words(left), m_column.size());
  m_size = left;
  evenOut();
  return true;
}

void LeafTimes::keep(int const* slots, int n) {
  if (m_form <= Form::Thinned)
    convert(smallestFor(static_cast<uint64>(storedOffset(m_size - 1))), m_start, m_unit);
  m_column.keep(slots, n, words());
  m_size = n;
  evenOut();
}

// The ends tell almost always whether the times are even, so that asking after every edit costs next to
// nothing.
void LeafTimes::evenOut() {
  if (even()) return;
  int64 const period = m_size > 1 ? (*this)[1] - front() : 0;
  if (m_size > 1) {
    if (static_cast<uint64>(back() - front()) !=
        static_cast<uint64>(period) * static_cast<uint64>(m_size - 1))
      return;
    for (int i = 2; i < m_size; ++i)
      if ((*this)[i] - (*this)[i - 1] != period) return;
  }
  m_start = m_size > 0 ? front() : 0;
  m_unit = period;
  m_form = Form::Even;
  m_column.clear();
}

void LeafTimes::pack() noexcept {
  if (m_form > Form::Thinned) {
    // What offsets have in common besides their unit.
    int64 common = 0;
    for (int i = 1; i < m_size && common != 1; ++i)
      common = std::gcd(common, storedOffset(i) - storedOffset(0));
    int64 const divisor = unit() * common;
    auto const units = static_cast<uint64>(back() - front()) / static_cast<uint64>(divisor);
    Form const form = smallestFor(units);
    try {
      if (units < static_cast<uint64>(m_size + kMostMissing)) {
        thinOut(divisor);
      } else if (form < m_form) {
        convert(form, front(), divisor);
      }
    } catch (std::bad_alloc const&) {
      // The form as it is does as well.
    }
  }
  m_column.shrink();
}

// Each count takes the place of a larger offset at or after it, so that this needs no memory.
void LeafTimes::thinOut(int64 divisor) {
  int64 const start = front(), first = storedOffset(0), scale = divisor / unit();
  for (int i = 0; i < m_size; ++i) {
    int64 const offset = storedOffset(i) - first;
    missing()[i] = static_cast<unsigned char>((scale == 1 ? offset : offset / scale) - i);
  }
  m_start = start;
  m_unit = divisor;
  m_form = Form::Thinned;
  m_column.erase(words(m_size), m_column.size());
}
