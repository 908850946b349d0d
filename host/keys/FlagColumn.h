// Which components the keys of a leaf hold, and which of them they bridge, in the smallest of three forms
// that holds this:
//  - none: every key is whole and bridges nothing;
//  - bits: every key is whole; it bridges all components where its bit is set, and else none;
//  - bytes: any.
// An edit may leave a larger form than is needed. The column does not know how many keys the leaf has,
// `size`.
#pragma once

#include "host/keys/KeyColumn.h"
#include "host/keys/KeyNode.h"

class FlagColumn {
 public:
  static constexpr unsigned kWhole = 7;

  bool none() const { return m_form == Form::None; }
  bool allWhole() const { return m_form != Form::Bytes; }  // as far as the form tells
  unsigned components(int slot) const { return allWhole() ? kWhole : m_column[slot] & kWhole; }
  unsigned bridges(int slot) const {
    return none() ? 0 : allWhole() ? bit(slot) * kWhole : m_column[slot] >> kBridgeShift;
  }
  // The next slot by Step from this one on that holds a component of the mask; -1 when there is none.
  template <int Step>
  int scanHolding(int slot, int size, unsigned mask) const {
    if (allWhole()) return slot >= 0 && slot < size && (mask & kWhole) ? slot : -1;
    for (; slot >= 0 && slot < size; slot += Step)
      if (m_column[slot] & kWhole & mask) return slot;
    return -1;
  }

  // Edits that throw for lack of memory leave the flags as they were. `limit` bounds the room that is kept.
  void insert(int slot, int n, KeyFlags const&, int size, int limit);
  void append(FlagColumn const& from, int first, int n, int size, int limit);
  // Takes away what was inserted, if it was.
  void takeBack(int slot, int n, int size);
  void erase(int first, int last, int size);
  // Leaves the n ascending slots.
  void keep(int const* slots, int n);
  // Makes the form one that can hold such flags, so that set() does.
  void makeHold(KeyFlags const&, int size, int limit);
  void set(int slot, KeyFlags const&);
  void clear();
  // The smallest form but for none, and no room for more, as far as there is memory for it.
  void pack(int size) noexcept;

  int64 bytes() const { return m_column.bytes(); }
  bool isWhole(int size) const {
    return m_column.size() == (none() ? 0 : m_form == Form::Bits ? bytesFor(size) : size);
  }

 private:
  enum class Form : unsigned char { None, Bits, Bytes };
  static constexpr int kBridgeShift = 3;
  static constexpr unsigned kBridged = kWhole | kWhole << kBridgeShift;

  static unsigned byteOf(KeyFlags const& flags) { return flags.components | flags.bridges << kBridgeShift; }
  static int bytesFor(int bits) { return (bits + 7) / 8; }
  unsigned bit(int slot) const { return m_column[slot / 8] >> slot % 8 & 1u; }
  void setBit(int slot, unsigned to) {
    unsigned char& byte = m_column[slot / 8];
    byte = static_cast<unsigned char>((byte & ~(1u << slot % 8)) | to << slot % 8);
  }
  void become(Form, int size, int limit);
  void truncate(int bytes) { m_column.erase(bytes, m_column.size()); }

  // Its padding holds the form: leaves are many.
  [[no_unique_address]] KeyColumn<unsigned char> m_column;
  Form m_form = Form::None;
};
