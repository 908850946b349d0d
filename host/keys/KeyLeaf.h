// A leaf of a key track: up to a few hundred keys. Each of its four parts has a compact form and a general
// one:
//  - times: LeafTimes;
//  - components and bridges: FlagColumn;
//  - selection: none while no key is selected, else a byte for each key;
//  - values: one key's while all are equal bit by bit, floats while that loses nothing, else doubles.
// A leaf with even times and no flags or selection is dense. An edit that breaks a form turns that part of
// that leaf alone. Components that a key does not hold have the value 0. Slots count from 0; arguments must
// be in range.
#pragma once

#include "host/keys/FlagColumn.h"
#include "host/keys/KeyColumn.h"
#include "host/keys/KeyNode.h"
#include "host/keys/LeafTimes.h"

class KeyLeaf final : public KeyNode {
 public:
  static constexpr unsigned kWhole = FlagColumn::kWhole;

  // `width` doubles in a key; `limit` keys at most.
  KeyLeaf(int width, int limit) : KeyNode(0), m_width(width), m_limit(limit) {}
  KeyLeaf(KeyLeaf const&) = default;
  KeyLeaf(KeyLeaf const&, int first, int last);  // some keys, at least one

  int size() const { return m_times.size(); }
  int limit() const { return m_limit; }
  bool full() const { return size() >= m_limit; }
  bool evenTimes() const { return m_times.even(); }
  bool plain() const { return m_flags.none(); }  // every key is whole and bridges nothing
  bool dense() const { return evenTimes() && plain() && m_selection.empty(); }

  int64 time(int slot) const { return m_times[slot]; }
  int64 firstTime() const { return m_times.front(); }
  int64 lastTime() const { return m_times.back(); }
  // The first key at or after the time, size() when there is none.
  int lowerBound(int64 time) const { return m_times.lowerBound(time); }
  // The time must not lie before the first key.
  int lastAtOrBefore(int64 time) const { return m_times.lastAtOrBefore(time); }
  int lastAtOrBefore(int64 time, int guess) const {  // fast when it is the guess or the next slot
    if (this->time(guess) <= time)
      for (int end = guess + 2; guess < end; ++guess)
        if (guess + 1 == size() || this->time(guess + 1) > time) return guess;
    return lastAtOrBefore(time);
  }

  unsigned components(int slot) const { return m_flags.components(slot); }
  unsigned bridges(int slot) const { return m_flags.bridges(slot); }
  unsigned selected(int slot) const { return m_selection.empty() ? 0 : m_selection[slot]; }
  KeyFlags flags(int slot) const { return {components(slot), bridges(slot), selected(slot)}; }
  double value(int slot, int component) const {
    if (m_form == Form::Double) return m_doubles[slot * m_width + component];
    if (m_form == Form::Float) return static_cast<double>(m_floats[slot * m_width + component]);
    return m_doubles[component];
  }
  void values(int slot, double* out) const {
    if (m_form == Form::Float) {
      for (int c = 0; c < m_width; ++c) out[c] = static_cast<double>(m_floats[slot * m_width + c]);
    } else {
      double const* from = m_doubles.data() + (m_form == Form::One ? 0 : slot * m_width);
      for (int c = 0; c < m_width; ++c) out[c] = from[c];
    }
  }

  // Whether every key holds a component of the mask.
  bool allHold(unsigned mask) const {
    return m_flags.allWhole() || counts.whole == size() || (mask == 1 && counts.held[0] == size()) ||
           (mask == 2 && counts.held[1] == size()) || (mask == 4 && counts.held[2] == size());
  }
  int64 period() const { return evenTimes() ? m_times.period() : 0; }  // 0 with one key too
  bool repeats() const { return m_form == Form::One; }                 // all values are equal bit by bit

  // Decodes the times of n slots.
  void readTimes(int slot, int n, int64* out) const { m_times.read(slot, n, out); }
  // Decodes the components first to before end of n slots, which are `step` apart: those of the i-th go to
  // out[i * stride] and after.
  void readValues(int slot, int step, int n, int first, int end, double* out, ptrdiff_t stride) const;

  // The first slot at or after (last at or before) `slot` that holds, or is selected on, a component of the
  // mask; -1 when there is none.
  int nextHolding(int slot, unsigned mask) const { return m_flags.scanHolding<1>(slot, size(), mask); }
  int previousHolding(int slot, unsigned mask) const { return m_flags.scanHolding<-1>(slot, size(), mask); }
  int nextSelected(int slot, unsigned mask) const { return scanSelection<1>(slot, mask); }
  int previousSelected(int slot, unsigned mask) const { return scanSelection<-1>(slot, mask); }
  // The same for keys that are selected on no component of the mask.
  int nextUnselected(int slot, unsigned mask) const { return scanSelection<1, false>(slot, mask); }
  int previousUnselected(int slot, unsigned mask) const { return scanSelection<-1, false>(slot, mask); }

  // Edits that throw for lack of memory leave the leaf as it was.
  void insert(int slot, int64 time, double const* values, KeyFlags const& flags);
  // n whole keys after the last one. The leaf must have room for them.
  void append(int64 start, int64 period, double const* values, int n);
  void append(KeyLeaf const& from, int first, int last);
  // The values of the components of the mask, and all flags.
  void write(int slot, double const* values, unsigned mask, KeyFlags const& flags);
  void erase(int first, int last);
  // Leaves the n ascending slots; cheaper than erasing the others run by run.
  void keep(int const* slots, int n);
  // To be called when an edit of many keys is done: gives back the room that it left, if there is memory for
  // it.
  void pack() noexcept;
  void setFlags(int slot, KeyFlags const& flags);
  // To be called when a series of setFlags is done.
  void dropIdleFlags();
  // Marks the components of the mask that keys hold in [first, last), or takes the mark away. Returns how
  // many keys hold (had marked) any of them.
  enum class Mark { Selected, Bridged };
  int mark(Mark what, bool on, unsigned mask, int first, int last);
  // Replaces the values of the whole keys in [first, last) by change(values). One call may serve for all keys
  // that have equal values.
  void transform(int first, int last, void (*change)(void*, double*), void* context);

  int64 memoryUse() const;
  // The text of the first broken invariant, null when all hold.
  char const* checkInvariants() const;

 private:
  enum class Form : unsigned char { One, Float, Double };
  using Column = KeyColumn<unsigned char>;

  // The first slot that is selected on any component of the mask, or on none of it.
  template <int Step, bool Any = true>
  int scanSelection(int slot, unsigned mask) const {
    if (m_selection.empty()) return slot >= 0 && slot < size() && !Any ? slot : -1;
    for (; slot >= 0 && slot < size(); slot += Step)
      if (((m_selection[slot] & mask) != 0) == Any) return slot;
    return -1;
  }

  template <class Add>
  void addWholly(int slot, int n, Add add);
  void insertValues(int slot, double const* values, int n);
  void insertFlags(int slot, KeyFlags const& flags, int n);
  void spellOutFlags(KeyFlags const& toBe);
  void eraseAllButValues(int first, int last);
  void countRange(KeyLeaf const& of, int first, int last, int by);
  void appendSelection(Column const& from, int first, int n);
  void insertSelection(unsigned selected, int slot, int n);
  template <class T, class ValueAt>
  void become(Form form, KeyColumn<T>& column, int n, ValueAt valueAt);
  void spellOutValues(bool asFloats);
  void widen();
  void setValues(double const* values, int n);
  void addValues(int slot, double const* values, int n);
  void putValues(int slot, double const* values);

  int m_width;
  int m_limit;
  Form m_form = Form::One;
  LeafTimes m_times;
  KeyColumn<double> m_doubles;  // with Form::One a single key's
  KeyColumn<float> m_floats;
  FlagColumn m_flags;
  Column m_selection;
};
