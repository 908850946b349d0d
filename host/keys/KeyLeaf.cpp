#include "host/keys/KeyLeaf.h"

#include <array>
#include <limits>
#include <vector>

namespace {

bool sameBits(const double* a, const double* b, int n) {
  return std::memcmp(a, b, static_cast<size_t>(n) * sizeof(double)) == 0;
}

bool allEqual(const double* values, int width, int n) {
  return sameBits(values, values + width, width * (n - 1));
}

bool fitFloats(const double* values, int n) {
  constexpr double kLargest = std::numeric_limits<float>::max();
  for (int i = 0; i < n; ++i)
    if (!(values[i] >= -kLargest && values[i] <= kLargest) ||
        static_cast<double>(static_cast<float>(values[i])) != values[i])
      return false;
  return true;
}

// How many of the ascending times lie before the time. Halves without branches, which could not be predicted.
int countBefore(const int64* times, int n, int64 time) {
  const int64* from = times;
  for (; n > 1; n -= n / 2) from += from[n / 2 - 1] < time ? n / 2 : 0;
  return static_cast<int>(from - times) + (n == 1 && *from < time);
}

// Values of every `step`-th key, of keys `width` wide, into a strided array.
template <class T>
void spread(const T* from, int width, int step, int n, int first, int end, double* out, ptrdiff_t stride) {
  if (step == 1 && first == 0 && end == width && stride == width) {
    std::copy_n(from, n * width, out);
    return;
  }
  for (int c = first; c < end; ++c, ++out)
    for (int i = 0; i < n; ++i) out[i * stride] = static_cast<double>(from[i * step * width + c]);
}

}  // namespace

int KeyLeaf::lowerBound(int64 time) const {
  if (time > lastTime()) return m_size;
  if (time <= firstTime()) return 0;
  if (evenTimes()) return static_cast<int>((time - m_start - 1) / m_period + 1);
  return countBefore(m_times.data(), m_size, time);
}

int KeyLeaf::lastAtOrBefore(int64 time) const {
  if (time >= lastTime()) return m_size - 1;
  if (evenTimes()) return static_cast<int>((time - m_start) / m_period);
  return countBefore(m_times.data(), m_size, time + 1) - 1;
}

void KeyLeaf::readTimes(int slot, int n, int64* out) const {
  if (evenTimes()) {
    for (int i = 0; i < n; ++i) out[i] = m_start + m_period * (slot + i);
  } else {
    std::copy_n(m_times.data() + slot, n, out);
  }
}

void KeyLeaf::readValues(int slot, int step, int n, int first, int end, double* out, ptrdiff_t stride) const {
  if (m_form == Form::Float) {
    spread(m_floats.data() + slot * m_width, m_width, step, n, first, end, out, stride);
  } else if (m_form == Form::Double) {
    spread(m_doubles.data() + slot * m_width, m_width, step, n, first, end, out, stride);
  } else {
    for (int i = 0; i < n; ++i) std::copy(m_doubles.data() + first, m_doubles.data() + end, out + i * stride);
  }
}

void KeyLeaf::insert(int slot, int64 time, const double* values, KeyFlags const& flags) {
  insertTimes(slot, time, 0, 1);
  insertValues(slot, values, 1);
  insertFlags(slot, flags, 1);
  ++m_size;
  evenOutTimes();
}

void KeyLeaf::append(int64 start, int64 period, const double* values, int n) {
  insertTimes(m_size, start, period, n);
  insertValues(m_size, values, n);
  insertFlags(m_size, {}, n);
  m_size += n;
}

void KeyLeaf::append(KeyLeaf const& from, int first, int last) {
  std::array<double, 4> one{};
  for (int slot = first; slot < last; ++slot) {
    from.values(slot, one.data());
    insert(m_size, from.time(slot), one.data(), from.flags(slot));
  }
}

void KeyLeaf::write(int slot, const double* values, unsigned mask) {
  std::array<double, 4> fresh{};
  this->values(slot, fresh.data());
  for (int c = 0; c < m_width; ++c)
    if (m_width != 3 || mask >> c & 1) fresh[static_cast<size_t>(c)] = values[c];
  putValues(slot, fresh.data());
  setFlags(slot, {components(slot) | mask, bridges(slot), selected(slot)});
}

void KeyLeaf::erase(int first, int last) {
  eraseTimes(first, last);
  if (m_form == Form::Double) m_doubles.erase(first * m_width, last * m_width);
  if (m_form == Form::Float) m_floats.erase(first * m_width, last * m_width);
  for (int slot = first; slot < last; ++slot) counts.count(flags(slot), -1);
  if (!plain()) m_flags.erase(first, last);
  if (!m_selection.empty()) m_selection.erase(first, last);
  m_size -= last - first;
  dropIdleFlags();
  evenOutTimes();
}

void KeyLeaf::setFlags(int slot, KeyFlags const& fresh) {
  const KeyFlags old = flags(slot);
  if (fresh == old) return;
  // Columns that have to be written out come first: there may be no memory for them.
  const unsigned bits = fresh.components | fresh.bridges << kBridgeShift;
  if (plain() && bits != kWhole) insertBits(m_flags, kWhole, kWhole, 0, 0);
  if (m_selection.empty() && fresh.selected) insertBits(m_selection, 0, 0, 0, 0);
  counts.count(old, -1);
  counts.count(fresh, 1);
  if (!plain()) m_flags[slot] = static_cast<unsigned char>(bits);
  if (!m_selection.empty()) m_selection[slot] = static_cast<unsigned char>(fresh.selected);
}

void KeyLeaf::dropIdleFlags() {
  if (!plain() && counts.whole == m_size && !counts.bridgesAny(kWhole)) m_flags.clear();
  if (!m_selection.empty() && counts.selected == 0) m_selection.clear();
}

void KeyLeaf::transform(int first, int last, void (*change)(void*, double*), void* context) {
  if (m_form == Form::One && plain() && first == 0 && last == m_size) {
    change(context, m_doubles.data());
    return;
  }
  std::vector<double> all(static_cast<size_t>(m_size * m_width));
  for (int slot = 0; slot < m_size; ++slot) {
    double* one = all.data() + slot * m_width;
    values(slot, one);
    if (slot >= first && slot < last && components(slot) == kWhole) change(context, one);
  }
  m_doubles.clear();
  m_floats.clear();
  const int size = std::exchange(m_size, 0);
  insertValues(0, all.data(), size);
  m_size = size;
}

bool KeyLeaf::continuesEvenly(int slot, int64 start, int64 period, int n) {
  if (n > 1 && m_size > 0 && (slot != m_size || start - lastTime() != period)) return false;
  if (m_size == 0) {
    m_start = start;
    m_period = period;
    return true;
  }
  if (m_size == 1) {
    m_period = slot == 1 ? start - m_start : m_start - start;
    if (slot == 0) m_start = start;
    return true;
  }
  if (slot == m_size) return start - lastTime() == m_period;
  if (slot != 0 || m_start - start != m_period) return false;
  m_start = start;
  return true;
}

void KeyLeaf::insertTimes(int slot, int64 start, int64 period, int n) {
  if (evenTimes()) {
    if (continuesEvenly(slot, start, period, n)) return;
    spellOutTimes();
  }
  int64* gap = m_times.open(slot, n, m_limit);
  for (int i = 0; i < n; ++i) gap[i] = start + period * i;
}

void KeyLeaf::eraseTimes(int first, int last) {
  if (evenTimes()) {
    if (last == m_size) return;
    if (first == 0) {
      m_start += m_period * last;
      return;
    }
    spellOutTimes();
  }
  m_times.erase(first, last);
}

void KeyLeaf::insertValues(int slot, const double* values, int n) {
  if (m_size == 0) {
    m_form = n == 1 || allEqual(values, m_width, n) ? Form::One
             : fitFloats(values, n * m_width)       ? Form::Float
                                                    : Form::Double;
  } else if (m_form == Form::One) {
    if (sameBits(values, m_doubles.data(), m_width) && allEqual(values, m_width, n)) return;
    spellOutValues(fitFloats(m_doubles.data(), m_width) && fitFloats(values, n * m_width));
  } else if (m_form == Form::Float && !fitFloats(values, n * m_width)) {
    widen();
  }

  if (m_form == Form::One) n = 1;
  if (m_form == Form::Float) {
    float* gap = m_floats.open(slot * m_width, n * m_width, m_limit * m_width);
    for (int i = 0; i < n * m_width; ++i) gap[i] = static_cast<float>(values[i]);
  } else {
    m_doubles.insert(slot * m_width, values, n * m_width, m_limit * m_width);
  }
}

void KeyLeaf::insertFlags(int slot, KeyFlags const& flags, int n) {
  const unsigned bits = flags.components | flags.bridges << kBridgeShift;
  if (bits != kWhole || !plain()) insertBits(m_flags, kWhole, bits, slot, n);
  if (flags.selected || !m_selection.empty()) insertBits(m_selection, 0, flags.selected, slot, n);
  for (int i = 0; i < n; ++i) counts.count(flags, 1);
}

// An absent column is written out first: each slot had the bits `absent`.
void KeyLeaf::insertBits(Column& column, unsigned absent, unsigned bits, int slot, int n) {
  const auto fill = [&](int at, int count, unsigned with) {
    std::memset(column.open(at, count, m_limit), static_cast<int>(with), static_cast<size_t>(count));
  };
  if (column.empty() && m_size > 0) fill(0, m_size, absent);
  if (n > 0) fill(slot, n, bits);
}

void KeyLeaf::putValues(int slot, const double* values) {
  if (m_form == Form::One) {
    if (sameBits(values, m_doubles.data(), m_width)) return;
    if (m_size > 1) spellOutValues(fitFloats(m_doubles.data(), m_width) && fitFloats(values, m_width));
  }
  if (m_form == Form::Float && !fitFloats(values, m_width)) widen();
  if (m_form == Form::Float) {
    for (int c = 0; c < m_width; ++c) m_floats[slot * m_width + c] = static_cast<float>(values[c]);
  } else {
    std::memcpy(m_doubles.data() + slot * m_width, values, static_cast<size_t>(m_width) * sizeof(double));
  }
}

void KeyLeaf::spellOutTimes() {
  int64* times = m_times.open(0, m_size, m_limit);
  for (int i = 0; i < m_size; ++i) times[i] = m_start + m_period * i;
}

// The ends tell almost always whether the times are even, so that asking after every edit costs next to
// nothing.
void KeyLeaf::evenOutTimes() {
  if (evenTimes() || m_size == 0) return;
  const int64 period = m_size > 1 ? m_times[1] - m_times[0] : 0;
  const auto length = static_cast<uint64>(lastTime() - firstTime());
  if (length != static_cast<uint64>(period) * static_cast<uint64>(m_size - 1)) return;
  for (int i = 2; i < m_size; ++i)
    if (m_times[i] - m_times[i - 1] != period) return;
  m_start = firstTime();
  m_period = period;
  m_times.clear();
}

void KeyLeaf::spellOutValues(bool asFloats) {
  std::array<double, 4> one{};
  values(0, one.data());
  m_doubles.clear();
  m_form = asFloats ? Form::Float : Form::Double;
  const int n = m_size * m_width;
  if (asFloats) {
    float* gap = m_floats.open(0, n, m_limit * m_width);
    for (int i = 0; i < n; ++i) gap[i] = static_cast<float>(one[static_cast<size_t>(i % m_width)]);
  } else {
    double* gap = m_doubles.open(0, n, m_limit * m_width);
    for (int i = 0; i < n; ++i) gap[i] = one[static_cast<size_t>(i % m_width)];
  }
}

void KeyLeaf::widen() {
  double* gap = m_doubles.open(0, m_floats.size(), m_limit * m_width);
  for (int i = 0; i < m_floats.size(); ++i) gap[i] = static_cast<double>(m_floats[i]);
  m_floats.clear();
  m_form = Form::Double;
}

int64 KeyLeaf::memoryUse() const {
  return static_cast<int64>(sizeof *this) + m_times.bytes() + m_doubles.bytes() + m_floats.bytes() +
         m_flags.bytes() + m_selection.bytes();
}

const char* KeyLeaf::checkInvariants() const {
  if (m_size == 0) return "a leaf is empty";
  if (m_size > m_limit) return "a leaf is too large";
  for (int slot = 1; slot < m_size; ++slot)
    if (time(slot) <= time(slot - 1)) return "key times do not ascend";

  const int stored = m_form == Form::One ? m_width : m_size * m_width;
  if ((m_form == Form::Float ? m_floats.size() : m_doubles.size()) != stored) return "values are missing";
  if (!evenTimes() && m_times.size() != m_size) return "times are missing";
  if (!plain() && m_flags.size() != m_size) return "flags are missing";
  if (!m_selection.empty() && m_selection.size() != m_size) return "selection is missing";

  KeyCounts expected;
  for (int slot = 0; slot < m_size; ++slot) {
    if (components(slot) == 0) return "a key holds no component";
    if (m_width != 3 && components(slot) != kWhole) return "a key that is keyed whole lacks components";
    if (m_width != 3 && bridges(slot) && bridges(slot) != kWhole) return "a key bridges in part";
    if (bridges(slot) & ~components(slot)) return "a component is bridged that the key does not hold";
    if (selected(slot) & ~components(slot)) return "a component is selected that the key does not hold";
    for (int c = 0; m_width == 3 && c < 3; ++c)
      if (!(components(slot) >> c & 1) && value(slot, c) != 0) return "an absent component has a value";
    expected.count(flags(slot), 1);
  }
  if (!(expected == counts)) return "the counts of a leaf are wrong";
  return nullptr;
}
