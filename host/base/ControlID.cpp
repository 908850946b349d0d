#include "host/base/ControlID.h"

#include <algorithm>

namespace {

uint64 s_last = 0;

}  // namespace

ControlID::ControlID(ECreateType type) : m_number(type == CreateUnique ? ++s_last : 0) {}

void ControlID::reserveUpTo(uint64 number) { s_last = std::max(s_last, number); }

std::basic_istringstream<wchar_t>& operator>>(std::basic_istringstream<wchar_t>& in, ControlID& id) {
  // Extraction into an unsigned would take "-1" for a large number.
  const bool negative = (in >> std::ws).peek() == L'-';
  uint64 number = 0;
  if (in >> number && !negative) id = ControlID(number);
  return in;
}

std::basic_ostringstream<wchar_t>& operator<<(std::basic_ostringstream<wchar_t>& out, ControlID const& id) {
  static_cast<std::wostream&>(out) << id.getNumber();
  return out;
}
