#include "session/ScriptText.h"

#include <algorithm>
#include <charconv>
#include <cmath>

namespace talix {

namespace {

// Beyond it the digits of a whole number say more than is known of it.
constexpr double kLargestWhole = 9007199254740992;

void appendInt(int value, std::string& out) {
  char text[16];
  out.append(text, std::to_chars(text, text + sizeof text, value).ptr);
}

// The shortest text; in a vector a whole number needs no point.
void appendNumber(double value, std::string& out) {
  char text[32];
  out.append(text, std::to_chars(text, text + sizeof text, value).ptr);
}

void appendFloat(double value, std::string& out) {
  if (std::isfinite(value) && std::abs(value) > kLargestWhole) {
    char text[32];
    out.append(text, std::to_chars(text, text + sizeof text, value, std::chars_format::scientific).ptr);
    return;
  }
  size_t const start = out.size();
  appendNumber(value, out);
  bool const whole = std::string_view(out).substr(start).find_first_of(".e") == std::string_view::npos;
  if (whole && std::isfinite(value)) out += ".0";
}

void appendBool(Variable::BoolType value, std::string& out) {
  static constexpr char const* words[] = {"false", "true", "toggle"};
  if (value >= Variable::False && value <= Variable::Toggle) {
    out += words[value];
  } else {
    appendInt(value, out);
  }
}

void appendVector(Vec3 const& value, std::string& out) {
  out += '<';
  appendNumber(value.x, out);
  out += ' ';
  appendNumber(value.y, out);
  out += ' ';
  appendNumber(value.z, out);
  out += '>';
}

bool needsQuotes(std::string_view text) {
  if (text.empty() || std::string_view("\"'<[#").find(text.front()) != std::string_view::npos) return true;
  if (std::any_of(text.begin(), text.end(), [](char c) { return isBlank(c) || c == ']'; })) return true;
  return readWord(text).kind != Word::String;
}

void appendElement(Variable const& value, Variable::VarType type, int i, std::string& out) {
  switch (type) {
    case Variable::Int:
      return appendInt(value.getIntValue(i), out);
    case Variable::Float:
      return appendFloat(value.getFloatValue(i), out);
    case Variable::Bool:
      return appendBool(value.getBoolValue(i), out);
    case Variable::Vector:
      return appendVector(value.getVecValue(i), out);
    case Variable::String:
      break;
    default:
      return;
  }
  std::string_view const text = value.getStringValue(i);
  if (value.isArray() && needsQuotes(text)) {
    out += quotedText(text);
  } else {
    out += text;
  }
}

bool equalsIgnoringCase(std::string_view word, std::string_view lower) {
  return std::equal(word.begin(), word.end(), lower.begin(), lower.end(),
                    [](char a, char b) { return (isLetter(a) ? static_cast<char>(a | 0x20) : a) == b; });
}

// A word that begins as a number does; `digits` is the word without its sign "+".
Word readNumber(std::string_view digits) {
  Word word;
  char const* const end = digits.data() + digits.size();
  auto const [intEnd, intError] = std::from_chars(digits.data(), end, word.integer);
  if (intEnd == end && intError == std::errc()) {
    word.kind = Word::Int;
    return word;
  }
  if (intEnd == end && intError == std::errc::result_out_of_range) {
    word.kind = Word::IntTooLarge;
    return word;
  }
  auto const [floatEnd, floatError] = std::from_chars(digits.data(), end, word.number);
  if (floatEnd != end) return {};
  if (floatError == std::errc()) word.kind = Word::Float;
  if (floatError == std::errc::result_out_of_range) word.kind = Word::FloatOutOfRange;
  return word;
}

Word booleanWord(Variable::BoolType value) {
  Word word;
  word.kind = Word::Bool;
  word.boolean = value;
  return word;
}

}  // namespace

Word readWord(std::string_view text) {
  if (text.empty()) return {};
  bool const sign = text.front() == '-' || text.front() == '+';
  std::string_view const unsignedText = text.substr(sign ? 1 : 0);
  if (unsignedText.empty()) return {};
  char const first = unsignedText.front();
  if ((first >= '0' && first <= '9') || first == '.')
    return readNumber(text.front() == '+' ? unsignedText : text);
  switch (first) {
    case 'n':
    case 'N':
    case 'i':
    case 'I':
      if (equalsIgnoringCase(unsignedText, "nan") || equalsIgnoringCase(unsignedText, "inf") ||
          equalsIgnoringCase(unsignedText, "infinity")) {
        Word word;
        word.kind = Word::NotFinite;
        return word;
      }
      break;
    case 't':
      if (text == "true") return booleanWord(Variable::True);
      if (text == "toggle") return booleanWord(Variable::Toggle);
      break;
    case 'f':
      if (text == "false") return booleanWord(Variable::False);
      break;
    case 'o':
      if (text == "on") return booleanWord(Variable::True);
      if (text == "off") return booleanWord(Variable::False);
      break;
    default:
      break;
  }
  return {};
}

void appendText(Variable const& value, std::string& out) {
  Variable::VarType const type = value.getType();
  if (!value.isArray()) return appendElement(value, type, -1, out);
  out += '[';
  for (int i = 0; i < value.getNumItems(); ++i) {
    if (i > 0) out += ' ';
    appendElement(value, static_cast<Variable::VarType>(type - Variable::kArray), i, out);
  }
  out += ']';
}

std::string toText(Variable const& value) {
  std::string text;
  appendText(value, text);
  return text;
}

std::string quotedText(std::string_view text) {
  std::string out = "\"";
  for (char const c : text) {
    if (c == '"') out += '"';
    out += c;
  }
  return out += '"';
}

std::string typeName(Variable::VarType type) {
  switch (type) {
    case Variable::None:
      return "nothing";
    case Variable::Int:
      return "integer";
    case Variable::Float:
      return "float";
    case Variable::String:
      return "string";
    case Variable::Bool:
      return "boolean";
    case Variable::Vector:
      return "vector";
    default:
      return typeName(static_cast<Variable::VarType>(type - Variable::kArray)) + " array";
  }
}

}  // namespace talix
