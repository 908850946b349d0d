// The ascending times of a leaf's keys, in the smallest of six forms that holds them:
//  - even: a start and a period;
//  - gaps: even times of which up to 64 are missing: 8 bits for each of these;
//  - thinned: even times of which up to 255 are missing: 8 bits for each key, that count those before it;
//  - short, long: offsets of 16 or 32 bits from a start, in units of a common divisor. Keys that lie on
//    frames have the frame as divisor, and then 16 bits reach over minutes and 32 over years;
//  - full: 64 bits.
// An edit may leave a larger form than is needed; pack() finds the smallest, and alone makes gaps and thinned
// times. Slots count from 0 and must be in range; `limit` bounds the room that is kept for further keys.
#pragma once

#include <cstdint>
#include <cstring>

#include "host/keys/KeyColumn.h"

class LeafTimes {
 public:
  int size() const { return m_size; }
  bool even() const { return m_form == Form::Even; }
  int64 period() const { return m_unit; }  // of even times; 0 with one key
  int64 operator[](int slot) const {
    if (m_form == Form::Even) return m_start + m_unit * slot;
    switch (m_form) {
      case Form::Even:
      case Form::Gaps:
        return m_start + m_unit * (slot + missingBefore(slot));
      case Form::Thinned:
        return m_start + m_unit * (slot + missing()[slot]);
      case Form::Short:
        return m_start + m_unit * stored<Short>(slot);
      case Form::Long:
        return m_start + m_unit * stored<Long>(slot);
      case Form::Full:
        break;
    }
    return stored<Full>(slot);
  }
  int64 front() const { return m_form <= Form::Thinned ? m_start : (*this)[0]; }
  int64 back() const { return (*this)[m_size - 1]; }

  int lowerBound(int64 time) const;      // the first at or after the time, size() when there is none
  int lastAtOrBefore(int64 time) const;  // the time must not lie before the first one
  void read(int slot, int n, int64* out) const;

  // Edits that throw for lack of memory leave the times as they were.
  void insert(int slot, int64 time, int limit);
  void append(int64 start, int64 period, int n, int limit);
  void append(LeafTimes const& from, int first, int last);
  void erase(int first, int last);
  // Leaves the n ascending slots.
  void keep(int const* slots, int n);
  // The smallest form, and no room for more, as far as there is memory for it.
  void pack() noexcept;

  int64 bytes() const { return m_column.bytes(); }
  bool isWhole() const {
    int const gapWords = m_form == Form::Gaps ? gapColumn(m_size, missingBefore(m_size - 1)) : 0;
    return m_column.size() == (even() ? 0 : m_form == Form::Gaps ? gapWords : words(m_size));
  }

 private:
  enum class Form : unsigned char { Even, Gaps, Thinned, Short, Long, Full };
  using Short = std::uint16_t;
  using Long = std::uint32_t;
  using Full = int64;

  // The offset at a slot, or with Full the time itself. All forms share one column of 16 bit words, so that a
  // leaf does not carry a column for each.
  template <class T>
  T stored(int slot) const {
    T value;
    std::memcpy(&value, m_column.data() + slot * static_cast<int>(sizeof(T) / sizeof(Short)), sizeof value);
    return value;
  }
  template <class T>
  void store(int slot, T value) {
    std::memcpy(m_column.data() + slot * static_cast<int>(sizeof(T) / sizeof(Short)), &value, sizeof value);
  }
  int countBefore(int64 units) const;
  template <class T>
  void storeRun(int slot, int64 first, int64 step, int n) {
    for (int i = 0; i < n; ++i) store(slot + i, static_cast<T>(first + step * i));
  }

  // With Thinned by slot. With Gaps for each kGroup slots how many are missing before the first of them, then
  // for each missing time the slot before it, then at least kAtOnce times kNoSlot. So a slot's count is found
  // by few comparisons, all at once. m_size is at most 256 then.
  unsigned char* missing() { return reinterpret_cast<unsigned char*>(m_column.data()); }
  unsigned char const* missing() const { return reinterpret_cast<unsigned char const*>(m_column.data()); }
  static constexpr int kGroup = 16, kAtOnce = 4;
  static constexpr unsigned char kNoSlot = 255;
  static int groups(int size) { return (size + kGroup - 1) / kGroup; }
  unsigned char const* gaps() const { return missing() + groups(m_size); }

  int missingBefore(int slot) const {
    unsigned char const* const all = gaps();
    int count = missing()[slot / kGroup], more = 0;
    do {
      more = 0;
      for (int i = 0; i < kAtOnce; ++i) more += all[count + i] < slot;
      count += more;
    } while (more == kAtOnce);
    return count;
  }
  // Brings the count at an earlier slot up to date for this one.
  int missingBefore(int slot, int count) const {
    for (unsigned char const* const all = gaps(); all[count] < slot;) ++count;
    return count;
  }

  static Form smallestFor(uint64 units);
  // That n times take; for the forms which store each time by itself.
  int words(int n = 1) const {
    return m_form == Form::Thinned ? (n + 1) / 2
           : m_form == Form::Short ? n
           : m_form == Form::Long  ? 2 * n
                                   : 4 * n;
  }
  // Times are base() + unit() * what is stored.
  int64 base() const { return m_form == Form::Full ? 0 : m_start; }
  int64 unit() const { return m_form == Form::Full ? 1 : m_unit; }
  int64 storedOffset(int slot) const;
  void add(int slot, int64 start, int64 period, int n, int limit);
  bool continueEvenly(int slot, int64 start, int64 period, int n);
  bool holds(int64 time) const;
  void makeHold(int64 start, int64 period, int n);
  void convert(Form, int64 start, int64 unit);
  void put(int slot, int64 start, int64 period, int n, int limit);
  void evenOut();
  void packOffsets();
  bool eraseGaps(int first, int last);
  bool eraseThinned(int first, int last);
  template <class Visit>
  void visitMissing(int64 divisor, Visit visit) const;
  static int gapColumn(int size, int missing) { return (groups(size) + missing + kAtOnce + 1) / 2; }
  void becomeGaps(int64 divisor);
  void putGaps(unsigned char const* slots, int n);
  void becomeThinned(int64 divisor);

  int64 m_start = 0;  // what periods or offsets count from; unused with Full
  int64 m_unit = 0;   // the period, or what offsets count
  int m_size = 0;
  Form m_form = Form::Even;
  KeyColumn<Short> m_column;
};
