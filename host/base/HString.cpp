#include "host/base/HString.h"

#include <cstdarg>
#include <cstdio>

#include "host/base/Text.h"

HString const HString::EMPTY_STRING;

int HString::ReverseFind(char c) const {
  size_t const at = m_text.rfind(c);
  return at == std::string::npos ? -1 : static_cast<int>(at);
}

void HString::MakeLower() {
  for (char& c : m_text)
    if (c >= 'A' && c <= 'Z') c = static_cast<char>(c - 'A' + 'a');
}

void HString::Format(char const* format, ...) {
  va_list args;
  va_start(args, format);
  m_text = formatted(format, args);
  va_end(args);
}

std::string formatted(char const* format, va_list args) {
  va_list again;
  va_copy(again, args);
  int const length = std::vsnprintf(nullptr, 0, format, args);
  std::string text;
  if (length > 0) {
    text.resize(static_cast<size_t>(length));
    std::vsnprintf(text.data(), text.size() + 1, format, again);
  }
  va_end(again);
  return text;
}
