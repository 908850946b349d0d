// Text helpers that need no HString.
#pragma once

#include <cstdarg>
#include <string>
#include <string_view>

// Without the blanks, tabs and line breaks around it.
inline std::string_view withoutOuterBlanks(std::string_view text) {
  constexpr std::string_view kBlanks = " \t\r\n";
  size_t const first = text.find_first_not_of(kBlanks);
  return first == std::string_view::npos ? std::string_view()
                                         : text.substr(first, text.find_last_not_of(kBlanks) - first + 1);
}

// printf into a string of the length it needs.
std::string formatted(char const* format, va_list args);
