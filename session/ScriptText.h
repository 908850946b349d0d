// Values as script text.
//
// Numbers, booleans, vectors, arrays and strings without line breaks can be typed back: numbers are the
// shortest text that reads back the same, floats always with a point or an exponent. A string alone is bare;
// inside an array it is quoted where it would not be read as that string. An empty value is empty text.
#pragma once

#include <string>
#include <string_view>

#include "host/command/Variable.h"

namespace talix {

void appendText(Variable const& value, std::string& out);
std::string toText(Variable const& value);

// The text between double quotes, with those inside doubled.
std::string quotedText(std::string_view text);

// "integer", "float array"; "nothing" for no type.
std::string typeName(Variable::VarType type);

// What a word of a script means when it stands unquoted.
struct Word {
  enum Kind { String, Int, Float, Bool, NotFinite, IntTooLarge, FloatOutOfRange } kind = String;
  int integer = 0;
  double number = 0;
  Variable::BoolType boolean = Variable::False;
};
Word readWord(std::string_view word);

// The characters between the tokens of a line.
constexpr bool isBlank(char c) { return c == ' ' || (c >= '\t' && c <= '\r'); }
constexpr bool isLetter(char c) { return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z'); }

}  // namespace talix
