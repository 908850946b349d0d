#include "host/keys/KeyLeaf.h"

#include <array>
#include <limits>
#include <vector>

namespace {

bool sameBits(double const* a, double const* b, int n) {
  return std::memcmp(a, b, static_cast<size_t>(n) * sizeof(double)) == 0;
}

bool allEqual(double const* values, int width, int n) {
  return sameBits(values, values + width, width * (n - 1));
}

bool fitFloats(double const* values, int n) {
  constexpr double kLargest = std::numeric_limits<float>::max();
  for (int i = 0; i < n; ++i)
    if (!(values[i] >= -kLargest && values[i] <= kLargest) ||
        static_cast<double>(static_cast<float>(values[i])) != values[i])
      return false;
  return true;
}

// Values of every `step`-th key, of keys `width` wide, into a strided array.
template <class T>
void spread(T const* from, int width, int step, int n, int first, int end, double* out, ptrdiff_t stride) {
  if (step == 1 && first == 0 && end == width && stride == width) {
    std::copy_n(from, n * width, out);
    return;
  }
  for (int c = first; c < end; ++c, ++out)
    for (int i = 0; i < n; ++i) out[i * stride] = static_cast<double>(from[i * step * width + c]);
}

}  // namespace

void KeyLeaf::readValues(int slot, int step, int n, int first, int end, double* out, ptrdiff_t stride) const {
  if (m_form == Form::Float) {
    spread(m_floats.data() + slot * m_width, m_width, step, n, first, end, out, stride);
  } else if (m_form == Form::Double) {
    spread(m_doubles.data() + slot * m_width, m_width, step, n, first, end, out, stride);
  } else {
    for (int i = 0; i < n; ++i) std::copy(m_doubles.data() + first, m_doubles.data() + end, out + i * stride);
  }
}

// Of the values, which are most of a leaf, only those are copied that are needed.
KeyLeaf::KeyLeaf(KeyLeaf const& o, int first, int last)
    : KeyNode(o),
      m_width(o.m_width),
      m_limit(o.m_limit),
      m_form(o.m_form),
      m_times(o.m_times),
      m_flags(o.m_flags),
      m_selection(o.m_selection) {
  int const from = first * m_width, n = (last - first) * m_width;
  if (m_form == Form::Float) {
    m_floats = {o.m_floats, from, n};
  } else {
    m_doubles = m_form == Form::One ? KeyColumn(o.m_doubles) : KeyColumn(o.m_doubles, from, n);
  }
  if (last < size()) eraseAllButValues(last, size());
  if (first > 0) eraseAllButValues(0, first);
}

// Lets add() put n keys at a slot, part by part and times last. Where it fails, what the other parts took is
// taken away again.
template <class Add>
void KeyLeaf::addWholly(int slot, int n, Add add) {
  try {
    add();
  } catch (...) {
    auto const takeBack = [=, this](auto& column, int width) {
      if (column.size() > size() * width) column.erase(slot * width, (slot + n) * width);
    };
    if (m_form == Form::Double) takeBack(m_doubles, m_width);
    if (m_form == Form::Float) takeBack(m_floats, m_width);
    m_flags.takeBack(slot, n, size());
    takeBack(m_selection, 1);
    throw;
  }
}

void KeyLeaf::insert(int slot, int64 time, double const* values, KeyFlags const& flags) {
  addWholly(slot, 1, [&] {
    insertValues(slot, values, 1);
    insertFlags(slot, flags, 1);
    m_times.insert(slot, time, m_limit);
  });
  counts.count(flags, 1);
}

void KeyLeaf::append(int64 start, int64 period, double const* values, int n) {
  addWholly(size(), n, [&] {
    insertValues(size(), values, n);
    insertFlags(size(), {}, n);
    m_times.append(start, period, n, m_limit);
  });
  counts.count({}, n);
}

void KeyLeaf::append(KeyLeaf const& from, int first, int last) {
  int const n = last - first;
  std::vector<double> values(static_cast<size_t>(n * m_width));
  from.readValues(first, 1, n, 0, m_width, values.data(), m_width);
  addWholly(size(), n, [&] {
    insertValues(size(), values.data(), n);
    m_flags.append(from.m_flags, first, n, size(), m_limit);
    appendSelection(from.m_selection, first, n);
    m_times.append(from.m_times, first, last);
  });
  countRange(from, first, last, 1);
}

void KeyLeaf::write(int slot, double const* values, unsigned mask, KeyFlags const& flags) {
  std::array<double, 4> fresh{};
  this->values(slot, fresh.data());
  for (int c = 0; c < m_width; ++c)
    if (m_width != 3 || mask >> c & 1) fresh[static_cast<size_t>(c)] = values[c];
  spellOutFlags(flags);
  putValues(slot, fresh.data());
  setFlags(slot, flags);
}

void KeyLeaf::erase(int first, int last) {
  eraseAllButValues(first, last);
  if (m_form == Form::Double) m_doubles.erase(first * m_width, last * m_width);
  if (m_form == Form::Float) m_floats.erase(first * m_width, last * m_width);
}

// Times come first: they may need memory for another form, of which there may be none.
void KeyLeaf::eraseAllButValues(int first, int last) {
  m_times.erase(first, last);
  countRange(*this, first, last, -1);
  m_flags.erase(first, last, size() + last - first);
  if (!m_selection.empty()) m_selection.erase(first, last);
  dropIdleFlags();
}

void KeyLeaf::keep(int const* slots, int n) {
  KeyCounts left;
  if (plain() && m_selection.empty()) left.count({}, n);
  for (int i = 0; left.keys < n; ++i) left.count(flags(slots[i]), 1);
  m_times.keep(slots, n);
  counts = left;
  if (m_form == Form::Double) m_doubles.keep(slots, n, m_width);
  if (m_form == Form::Float) m_floats.keep(slots, n, m_width);
  m_flags.keep(slots, n);
  if (!m_selection.empty()) m_selection.keep(slots, n, 1);
  dropIdleFlags();
}

// Counts keys of a leaf here: once more (by 1) or less (by -1).
void KeyLeaf::countRange(KeyLeaf const& of, int first, int last, int by) {
  if (of.plain() && of.m_selection.empty()) return counts.count({}, by * (last - first));
  for (int slot = first; slot < last; ++slot) counts.count(of.flags(slot), by);
}

int KeyLeaf::mark(Mark what, bool on, unsigned mask, int first, int last) {
  bool const bridges = what == Mark::Bridged;
  if (on) spellOutFlags({kWhole, bridges ? mask : 0, bridges ? 0 : mask});
  if (bridges ? plain() : m_selection.empty()) return 0;
  // A part of a bridge needs another form, whether it comes or goes.
  if (bridges) m_flags.makeHold({kWhole, mask}, size(), m_limit);
  int touchedKeys = 0, keys = 0, byComponent[3] = {};  // keys that are marked, or no longer are
  for (int slot = first; slot < last; ++slot) {
    unsigned const held = components(slot), now = bridges ? this->bridges(slot) : m_selection[slot];
    unsigned const touched = mask & (on ? held : now), then = on ? now | touched : now & ~touched;
    unsigned const turned = now ^ then;
    if (bridges) {
      m_flags.set(slot, {held, then});
    } else {
      m_selection[slot] = static_cast<unsigned char>(then);
    }
    touchedKeys += touched != 0;
    keys += (now == 0) != (then == 0);
    for (int c = 0; c < 3; ++c) byComponent[c] += static_cast<int>(turned >> c & 1);
  }
  int const by = on ? 1 : -1;
  if (!bridges) counts.selected += by * keys;
  for (int c = 0; c < 3; ++c) (bridges ? counts.bridging : counts.selectedOn)[c] += by * byComponent[c];
  dropIdleFlags();
  return touchedKeys;
}

void KeyLeaf::pack() noexcept {
  m_times.pack();
  m_doubles.shrink();
  m_floats.shrink();
  m_flags.pack(size());
  m_selection.shrink();
}

void KeyLeaf::setFlags(int slot, KeyFlags const& fresh) {
  KeyFlags const old = flags(slot);
  if (fresh == old) return;
  spellOutFlags(fresh);
  counts.count(old, -1);
  counts.count(fresh, 1);
  m_flags.set(slot, fresh);
  if (!m_selection.empty()) m_selection[slot] = static_cast<unsigned char>(fresh.selected);
}

// Writes out the columns that a key with these flags needs, so that nothing else of its edit can fail.
void KeyLeaf::spellOutFlags(KeyFlags const& toBe) {
  m_flags.makeHold(toBe, size(), m_limit);
  if (toBe.selected) insertSelection(0, 0, 0);
}

void KeyLeaf::dropIdleFlags() {
  if (!plain() && counts.whole == size() && !counts.bridgesAny(kWhole)) m_flags.clear();
  if (!m_selection.empty() && counts.selected == 0) m_selection.clear();
}

void KeyLeaf::transform(int first, int last, void (*change)(void*, double*), void* context) {
  if (m_form == Form::One && plain() && first == 0 && last == size()) {
    change(context, m_doubles.data());
    return;
  }
  std::vector<double> all(static_cast<size_t>(size() * m_width));
  for (int slot = 0; slot < size(); ++slot) {
    double* one = all.data() + slot * m_width;
    values(slot, one);
    if (slot >= first && slot < last && components(slot) == kWhole) change(context, one);
  }
  setValues(all.data(), size());
}

// Replaces all values, whose number may change.
void KeyLeaf::setValues(double const* values, int n) {
  bool const one = n == 1 || allEqual(values, m_width, n);
  auto const valueAt = [values](int i) { return values[i]; };
  if (!one && fitFloats(values, n * m_width)) return become(Form::Float, m_floats, n * m_width, valueAt);
  become(one ? Form::One : Form::Double, m_doubles, (one ? 1 : n) * m_width, valueAt);
}

// Replaces all values by n of them in another form.
template <class T, class ValueAt>
void KeyLeaf::become(Form form, KeyColumn<T>& column, int n, ValueAt valueAt) {
  KeyColumn<T> fresh;
  T* to = fresh.open(0, n, m_limit * m_width);
  for (int i = 0; i < n; ++i) to[i] = static_cast<T>(valueAt(i));
  m_doubles.clear();
  m_floats.clear();
  column = std::move(fresh);
  m_form = form;
}

void KeyLeaf::insertValues(int slot, double const* values, int n) {
  if (size() == 0) return setValues(values, n);
  if (m_form == Form::One) {
    if (sameBits(values, m_doubles.data(), m_width) && allEqual(values, m_width, n)) return;
    spellOutValues(fitFloats(m_doubles.data(), m_width) && fitFloats(values, n * m_width));
  } else if (m_form == Form::Float && !fitFloats(values, n * m_width)) {
    widen();
  }
  addValues(slot, values, n);
}

// The form must hold them.
void KeyLeaf::addValues(int slot, double const* values, int n) {
  if (m_form == Form::One) n = 1;
  if (m_form == Form::Float) {
    float* gap = m_floats.open(slot * m_width, n * m_width, m_limit * m_width);
    for (int i = 0; i < n * m_width; ++i) gap[i] = static_cast<float>(values[i]);
  } else {
    m_doubles.insert(slot * m_width, values, n * m_width, m_limit * m_width);
  }
}

void KeyLeaf::insertFlags(int slot, KeyFlags const& flags, int n) {
  m_flags.insert(slot, n, flags, size(), m_limit);
  if (flags.selected || !m_selection.empty()) insertSelection(flags.selected, slot, n);
}

void KeyLeaf::appendSelection(Column const& from, int first, int n) {
  if (m_selection.empty() && from.empty()) return;
  if (from.empty()) return insertSelection(0, size(), n);
  insertSelection(0, 0, 0);
  m_selection.insert(m_selection.size(), from.data() + first, n, m_limit);
}

// An absent column is written out first.
void KeyLeaf::insertSelection(unsigned selected, int slot, int n) {
  auto const fill = [&](int at, int count, unsigned with) {
    std::memset(m_selection.open(at, count, m_limit), static_cast<int>(with), static_cast<size_t>(count));
  };
  if (m_selection.empty() && size() > 0) fill(0, size(), 0);
  if (n > 0) fill(slot, n, selected);
}

void KeyLeaf::putValues(int slot, double const* values) {
  if (m_form == Form::One) {
    if (sameBits(values, m_doubles.data(), m_width)) return;
    if (size() > 1) spellOutValues(fitFloats(m_doubles.data(), m_width) && fitFloats(values, m_width));
  }
  if (m_form == Form::Float && !fitFloats(values, m_width)) widen();
  if (m_form == Form::Float) {
    for (int c = 0; c < m_width; ++c) m_floats[slot * m_width + c] = static_cast<float>(values[c]);
  } else {
    std::memcpy(m_doubles.data() + slot * m_width, values, static_cast<size_t>(m_width) * sizeof(double));
  }
}

void KeyLeaf::spellOutValues(bool asFloats) {
  std::array<double, 4> one{};
  values(0, one.data());
  auto const valueAt = [this, &one](int i) { return one[static_cast<size_t>(i % m_width)]; };
  int const n = size() * m_width;
  asFloats ? become(Form::Float, m_floats, n, valueAt) : become(Form::Double, m_doubles, n, valueAt);
}

void KeyLeaf::widen() {
  become(Form::Double, m_doubles, m_floats.size(), [this](int i) { return m_floats[i]; });
}

int64 KeyLeaf::memoryUse() const {
  return static_cast<int64>(sizeof *this) + m_times.bytes() + m_doubles.bytes() + m_floats.bytes() +
         m_flags.bytes() + m_selection.bytes();
}

char const* KeyLeaf::checkInvariants() const {
  if (size() == 0) return "a leaf is empty";
  if (size() > m_limit) return "a leaf is too large";
  for (int slot = 1; slot < size(); ++slot)
    if (time(slot) <= time(slot - 1)) return "key times do not ascend";

  int const stored = m_form == Form::One ? m_width : size() * m_width;
  if ((m_form == Form::Float ? m_floats.size() : m_doubles.size()) != stored) return "values are missing";
  if (!m_times.isWhole()) return "times are missing";
  if (!m_flags.isWhole(size())) return "flags are missing";
  if (!m_selection.empty() && m_selection.size() != size()) return "selection is missing";

  KeyCounts expected;
  for (int slot = 0; slot < size(); ++slot) {
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
