#include "host/base/ControlID.h"

#include <algorithm>

#include "host/base/ThreadLocal.h"

namespace {

TALIX_THREAD_LOCAL uint64 t_own = 0;
TALIX_THREAD_LOCAL uint64* t_counter = nullptr;

uint64& lastNumber() { return t_counter ? *t_counter : t_own; }

}  // namespace

ControlID::ControlID(ECreateType type) : m_number(type == CreateUnique ? ++lastNumber() : 0) {}

void ControlID::reserveUpTo(uint64 number) { lastNumber() = std::max(lastNumber(), number); }

void ControlID::setCounter(uint64* last) { t_counter = last; }

std::basic_istringstream<wchar_t>& operator>>(std::basic_istringstream<wchar_t>& in, ControlID& id) {
  // Extraction into an unsigned would take "-1" for a large number.
  bool const negative = (in >> std::ws).peek() == L'-';
  uint64 number = 0;
  if (in >> number && !negative) id = ControlID(number);
  return in;
}

std::basic_ostringstream<wchar_t>& operator<<(std::basic_ostringstream<wchar_t>& out, ControlID const& id) {
  static_cast<std::wostream&>(out) << id.getNumber();
  return out;
}
