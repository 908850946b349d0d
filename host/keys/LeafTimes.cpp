#include "host/keys/LeafTimes.h"

#include <algorithm>
#include <limits>
#include <numeric>
#include <vector>

namespace {

constexpr int64 kMostMissing = std::numeric_limits<unsigned char>::max();
constexpr int kMostGaps = 64;

// The first of n slots that is not before what is searched for. Halves without branches, which could not be
// predicted.
template <class IsBefore>
int search(int n, IsBefore isBefore) {
  int from = 0;
  for (; n > 1; n -= n / 2) from += isBefore(from + n / 2 - 1) ? n / 2 : 0;
  return from + (n == 1 && isBefore(from));
}

}  // namespace

// With Even the slot, with Full the time.
int64 LeafTimes::storedOffset(int slot) const {
  return m_form == Form::Even      ? slot
         : m_form == Form::Gaps    ? slot + missingBefore(slot)
         : m_form == Form::Thinned ? slot + missing()[slot]
         : m_form == Form::Short   ? stored<Short>(slot)
         : m_form == Form::Long    ? stored<Long>(slot)
                                   : stored<Full>(slot);
}

// How many offsets lie before the units, or with Full times before the time, which must not be more than is
// stored.
int LeafTimes::countBefore(int64 units) const {
  auto const value = static_cast<int>(units);
  switch (m_form) {
    case Form::Even:
      return value;
    case Form::Gaps:
      return value -
             search(missingBefore(m_size - 1), [=, all = gaps()](int i) { return all[i] < value - 1 - i; });
    case Form::Thinned:
      return search(m_size, [=, all = missing()](int i) { return all[i] < value - i; });
    case Form::Short:
      return search(m_size, [=, this](int i) { return stored<Short>(i) < value; });
    case Form::Long:
      return search(m_size, [=, this](int i) { return stored<Long>(i) < units; });
    case Form::Full:
      break;
  }
  return search(m_size, [=, this](int i) { return stored<Full>(i) < units; });
}

int LeafTimes::lowerBound(int64 time) const {
  if (time > back()) return m_size;
  if (time <= front()) return 0;
  return countBefore(m_form == Form::Full ? time : (time - m_start - 1) / m_unit + 1);
}

int LeafTimes::lastAtOrBefore(int64 time) const {
  if (time >= back()) return m_size - 1;
  if (even()) return static_cast<int>((time - m_start) / m_unit);
  return countBefore(m_form == Form::Full ? time + 1 : (time - m_start) / m_unit + 1) - 1;
}

void LeafTimes::read(int slot, int n, int64* out) const {
  auto const decode = [&](auto offsetAt) {
    for (int i = 0; i < n; ++i) out[i] = m_start + m_unit * offsetAt(slot + i);
  };
  switch (m_form) {
    case Form::Even:
      return decode([](int i) { return i; });
    case Form::Gaps:
      for (int i = 0, before = missingBefore(slot); i < n; ++before) {
        int const end = std::min(n, gaps()[before] + 1 - slot);
        for (; i < end; ++i) out[i] = m_start + m_unit * (slot + i + before);
      }
      return;
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
  if (m_form <= Form::Thinned) return false;
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
    int before = 0;
    for (int i = 0; i < m_size; ++i) {
      if (m_form == Form::Gaps) before = missingBefore(i, before);
      int64 const stored = m_form == Form::Gaps ? i + before : storedOffset(i);
      int64 const time = base() + this->unit() * stored;
      int64 const offset = form == Form::Full ? time
                           : scales           ? shift + scale * stored
                                              : (time - start) / unit;
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
  if (m_form == Form::Gaps && eraseGaps(first, last)) return;
  if (m_form == Form::Thinned && eraseThinned(first, last)) return;
  if (m_form <= Form::Thinned)
    convert(smallestFor(static_cast<uint64>(storedOffset(m_size - 1))), m_start, m_unit);
  m_column.erase(words(first), words(last));
  m_size -= last - first;
  evenOut();
}

// At an end alone: there they keep their form, which needs no memory.
bool LeafTimes::eraseGaps(int first, int last) {
  if (first > 0 && last < m_size) return false;
  int const shift = first == 0 ? last : 0, left = m_size - (last - first);
  int const before = missingBefore(shift), end = left > 0 ? missingBefore(shift + left - 1) : before;
  if (left > 0) m_start = (*this)[shift];
  unsigned char kept[kMostGaps];
  for (int i = before; i < end; ++i) kept[i - before] = static_cast<unsigned char>(gaps()[i] - shift);
  m_size = left;
  putGaps(kept, end - before);
  evenOut();
  return true;
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
  try {
    // Keys may have gone and gaps stayed.
    if (m_form == Form::Gaps && m_column.size() > (m_size + 1) / 2) convert(Form::Short, m_start, m_unit);
    if (m_form > Form::Gaps) packOffsets();
  } catch (std::bad_alloc const&) {
    // The form as it is does as well.
  }
  m_column.shrink();
}

void LeafTimes::packOffsets() {
  // What offsets have in common besides their unit.
  int64 common = 0;
  for (int i = 1; i < m_size && common != 1; ++i)
    common = std::gcd(common, storedOffset(i) - storedOffset(0));
  int64 const divisor = unit() * common;
  auto const units = static_cast<uint64>(back() - front()) / static_cast<uint64>(divisor);
  auto const missing = units - static_cast<uint64>(m_size - 1);
  if (missing <= kMostGaps && m_size <= kNoSlot + 1 &&
      gapColumn(m_size, static_cast<int>(missing)) < (m_size + 1) / 2) {
    becomeGaps(divisor);
  } else if (missing <= kMostMissing) {
    if (m_form > Form::Thinned) becomeThinned(divisor);
  } else if (smallestFor(units) < m_form) {
    convert(smallestFor(units), front(), divisor);
  }
}

// Calls visit(slot, how many times are missing before it, by a divisor of all distances).
template <class Visit>
void LeafTimes::visitMissing(int64 divisor, Visit visit) const {
  int64 const first = storedOffset(0), scale = divisor / unit();
  for (int i = 0; i < m_size; ++i) {
    int64 const offset = storedOffset(i) - first;
    visit(i, static_cast<int>((scale == 1 ? offset : offset / scale) - i));
  }
}

// The form is smaller than the one before, so that this needs no memory.
void LeafTimes::becomeGaps(int64 divisor) {
  unsigned char slots[kMostGaps];
  int count = 0;
  visitMissing(divisor, [&](int slot, int missing) {
    while (count < missing) slots[count++] = static_cast<unsigned char>(slot - 1);
  });
  int64 const start = front();
  m_form = Form::Gaps;
  m_start = start;
  m_unit = divisor;
  putGaps(slots, count);
}

// The column must have room for them.
void LeafTimes::putGaps(unsigned char const* slots, int n) {
  m_column.erase(gapColumn(m_size, n), m_column.size());
  unsigned char *const all = missing(), *const end = all + 2 * m_column.size();
  for (int group = 0, before = 0; group < groups(m_size); ++group) {
    while (before < n && slots[before] < group * kGroup) ++before;
    all[group] = static_cast<unsigned char>(before);
  }
  std::fill(std::copy_n(slots, n, all + groups(m_size)), end, kNoSlot);
}

// The same: each count takes the place of a larger offset at or after it.
void LeafTimes::becomeThinned(int64 divisor) {
  int64 const start = front();
  visitMissing(divisor, [&](int slot, int count) { missing()[slot] = static_cast<unsigned char>(count); });
  m_form = Form::Thinned;
  m_start = start;
  m_unit = divisor;
  m_column.erase(words(m_size), m_column.size());
}
