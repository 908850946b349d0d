#include "host/keys/FlagColumn.h"

// Writes out the flags in a larger form.
void FlagColumn::become(Form form, int size, int limit) {
  KeyColumn<unsigned char> fresh;
  if (form == Form::Bits) {
    std::memset(fresh.open(0, bytesFor(size), bytesFor(size)), 0, static_cast<size_t>(bytesFor(size)));
  } else {
    unsigned char* to = fresh.open(0, size, limit);
    for (int i = 0; i < size; ++i) to[i] = !none() && bit(i) ? kBridged : kWhole;
  }
  m_column = std::move(fresh);
  m_form = form;
}

void FlagColumn::makeHold(KeyFlags const& flags, int size, int limit) {
  unsigned const byte = byteOf(flags);
  if (m_form == Form::Bytes || (none() && byte == kWhole)) return;
  bool const fitsBits = byte == kWhole || byte == kBridged;
  if (none() || !fitsBits) become(fitsBits ? Form::Bits : Form::Bytes, size, limit);
}

void FlagColumn::set(int slot, KeyFlags const& flags) {
  if (m_form == Form::Bits) setBit(slot, flags.bridges != 0);
  if (m_form == Form::Bytes) m_column[slot] = static_cast<unsigned char>(byteOf(flags));
}

void FlagColumn::insert(int slot, int n, KeyFlags const& flags, int size, int limit) {
  unsigned const byte = byteOf(flags);
  if (none() && byte == kWhole) return;
  if (allWhole()) become(Form::Bytes, size, limit);
  if (n > 0) std::memset(m_column.open(slot, n, limit), static_cast<int>(byte), static_cast<size_t>(n));
}

void FlagColumn::append(FlagColumn const& from, int first, int n, int size, int limit) {
  if (none() && from.none()) return;
  if (allWhole()) become(Form::Bytes, size, limit);
  unsigned char* to = m_column.open(size, n, limit);
  for (int i = 0; i < n; ++i)
    to[i] = static_cast<unsigned char>(byteOf({from.components(first + i), from.bridges(first + i)}));
}

void FlagColumn::takeBack(int slot, int n, int size) {
  if (m_form == Form::Bytes && m_column.size() > size) m_column.erase(slot, slot + n);
}

void FlagColumn::erase(int first, int last, int size) {
  if (m_form == Form::Bytes) m_column.erase(first, last);
  if (m_form != Form::Bits) return;
  for (int slot = last; slot < size; ++slot) setBit(first + slot - last, bit(slot));
  truncate(bytesFor(size - (last - first)));
}

void FlagColumn::keep(int const* slots, int n) {
  if (m_form == Form::Bytes) m_column.keep(slots, n, 1);
  if (m_form != Form::Bits) return;
  for (int i = 0; i < n; ++i) setBit(i, bit(slots[i]));
  truncate(bytesFor(n));
}

void FlagColumn::clear() {
  m_column.clear();
  m_form = Form::None;
}

void FlagColumn::pack(int size) noexcept {
  bool const fitsBits = m_form == Form::Bytes &&
                        std::all_of(m_column.data(), m_column.data() + size,
                                    [](unsigned flags) { return flags == kWhole || flags == kBridged; });
  if (fitsBits) {
    // Bits take the place of bytes that were read.
    for (int slot = 0; slot < size; slot += 8) {
      unsigned bits = 0;
      for (int i = slot; i < std::min(slot + 8, size); ++i)
        bits |= (m_column[i] >> kBridgeShift & 1u) << (i - slot);
      m_column[slot / 8] = static_cast<unsigned char>(bits);
    }
    m_form = Form::Bits;
    truncate(bytesFor(size));
  }
  m_column.shrink();
}
