// Text helpers that need no HString.
#pragma once

#include <cstdarg>
#include <string>

// printf into a string of the length it needs.
std::string formatted(char const* format, va_list args);
