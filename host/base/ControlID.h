// Identifier of a module, channel or attribute, unique for the life of the scene. Its text is a decimal
// number; 0 is blank and names nothing.
#pragma once

#include <functional>
#include <sstream>

#include "host/base/Types.h"

class ControlID {
 public:
  enum ECreateType { CreateUnique = 0, CreateBlank = 1 };

  ControlID() = default;  // blank
  explicit ControlID(ECreateType type);
  explicit ControlID(uint64 number) : m_number(number) {}

  bool isBlank() const { return m_number == 0; }
  uint64 getNumber() const { return m_number; }
  bool operator==(ControlID const&) const = default;

  // Unique numbers of this thread's counter start after this one, so that identifiers read from a file are
  // not given out again.
  static void reserveUpTo(uint64 number);
  // Where this thread takes its unique numbers from: the last one given out, which the caller (a scene) owns.
  // Null: the thread's own.
  static void setCounter(uint64* last);

 private:
  uint64 m_number = 0;
};

// Text that is no decimal number leaves the identifier as it was.
std::basic_istringstream<wchar_t>& operator>>(std::basic_istringstream<wchar_t>& in, ControlID& id);
std::basic_ostringstream<wchar_t>& operator<<(std::basic_ostringstream<wchar_t>& out, ControlID const& id);

template <>
struct std::hash<ControlID> {
  size_t operator()(ControlID const& id) const { return std::hash<uint64>()(id.getNumber()); }
};
