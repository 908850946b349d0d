#include "io/TextScanner.h"

#include <algorithm>
#include <charconv>
#include <cmath>
#include <limits>

#include "io/FileError.h"

namespace talix {

namespace {

bool isBlank(char c) { return c == ' ' || c == '\t' || c == '\v' || c == '\f'; }
bool isLineEnd(char c) { return c == '\n' || c == '\r'; }
bool isBrace(char c) { return c == '{' || c == '}'; }
char lower(char c) { return c >= 'A' && c <= 'Z' ? static_cast<char>(c + ('a' - 'A')) : c; }

constexpr std::string_view kByteOrderMark = "\xEF\xBB\xBF";

}  // namespace

TextScanner::TextScanner(FileBytes const& bytes) : m_bytes(bytes), m_text(bytes.view()) {
  if (m_text.substr(0, kByteOrderMark.size()) == kByteOrderMark) m_at = kByteOrderMark.size();
}

void TextScanner::skipBlanks() {
  while (m_at < m_text.size() && isBlank(m_text[m_at])) ++m_at;
}

void TextScanner::skipWhite() {
  for (; m_at < m_text.size(); ++m_at) {
    char const c = m_text[m_at];
    if (isBlank(c)) continue;
    if (!isLineEnd(c)) return;
    bool const halfOfTwo = c == '\r' && m_at + 1 < m_text.size() && m_text[m_at + 1] == '\n';
    if (!halfOfTwo) ++m_line;
  }
}

std::string_view TextScanner::takeWord() {
  skipWhite();
  size_t const start = m_at;
  if (m_at < m_text.size() && isBrace(m_text[m_at])) return m_text.substr(m_at++, 1);
  while (m_at < m_text.size()) {
    char const c = m_text[m_at];
    if (isBlank(c) || isLineEnd(c) || isBrace(c)) break;
    ++m_at;
  }
  return m_text.substr(start, m_at - start);
}

std::string_view TextScanner::peekWord() {
  skipWhite();
  size_t const start = m_at;
  std::string_view const word = takeWord();
  m_at = start;
  return word;
}

bool TextScanner::atEnd() {
  skipWhite();
  return m_at == m_text.size();
}

bool TextScanner::atLineEnd() {
  skipBlanks();
  return m_at == m_text.size() || isLineEnd(m_text[m_at]);
}

bool TextScanner::accept(std::string_view lowerCase) {
  skipWhite();
  if (!startsIgnoringCase(m_text.substr(m_at), lowerCase)) return false;
  m_at += lowerCase.size();
  return true;
}

std::string_view TextScanner::takeRestOfLine() {
  size_t const start = m_at;
  while (m_at < m_text.size() && !isLineEnd(m_text[m_at]) && !isBrace(m_text[m_at])) ++m_at;
  return trimmed(m_text.substr(start, m_at - start));
}

bool TextScanner::takeLine(std::string_view& text) {
  if (m_at == m_text.size()) return false;
  size_t const end = std::min(m_text.find_first_of("\r\n", m_at), m_text.size());
  text = m_text.substr(m_at, end - m_at);
  m_at = end;
  if (m_at < m_text.size()) m_at += m_text.substr(m_at, 2) == "\r\n" ? 2 : 1;
  ++m_line;
  return true;
}

double TextScanner::takeNumber(char const* expected) {
  std::string_view const word = takeWord();
  auto const number = parseNumber(word);
  if (!number || !std::isfinite(*number)) fail(std::string(expected) + " expected, not " + found(word));
  return *number;
}

void TextScanner::failAt(int64 line, std::string const& what) const {
  throw FileError::atLine(m_bytes.path(), line, what);
}

std::optional<double> parseNumber(std::string_view word) {
  if (word.size() > 1 && word[0] == '+' && word[1] != '-') word.remove_prefix(1);
  double value = 0;
  auto const [end, error] = std::from_chars(word.data(), word.data() + word.size(), value);
  if (end != word.data() + word.size() || error == std::errc::invalid_argument) return std::nullopt;
  if (error != std::errc::result_out_of_range) return value;
  // Out of range is too large or too small; only an exponent's sign tells which without parsing again.
  size_t const exponent = word.find_first_of("eE");
  bool const tiny = exponent == std::string_view::npos ? word.find_first_of("123456789") > word.find('.')
                                                       : word.substr(exponent + 1, 1) == "-";
  return tiny ? 0.0 : std::copysign(std::numeric_limits<double>::infinity(), word[0] == '-' ? -1.0 : 1.0);
}

std::string_view trimmed(std::string_view text) {
  while (!text.empty() && (isBlank(text.front()) || isLineEnd(text.front()))) text.remove_prefix(1);
  while (!text.empty() && (isBlank(text.back()) || isLineEnd(text.back()))) text.remove_suffix(1);
  return text;
}

bool startsIgnoringCase(std::string_view text, std::string_view lowerCase) {
  if (text.size() < lowerCase.size()) return false;
  for (size_t i = 0; i < lowerCase.size(); ++i)
    if (lower(text[i]) != lowerCase[i]) return false;
  return true;
}

bool equalsIgnoringCase(std::string_view text, std::string_view lowerCase) {
  return text.size() == lowerCase.size() && startsIgnoringCase(text, lowerCase);
}

std::string shown(std::string_view text) {
  constexpr size_t kLongest = 40;
  size_t length = text.size();
  if (length > kLongest) {
    length = kLongest;
    while (length > 0 && (text[length] & '\xC0') == '\x80') --length;  // not inside a UTF-8 character
  }
  std::string result = "\"";
  for (char const c : text.substr(0, length)) {
    auto const byte = static_cast<unsigned char>(c);
    result += byte < 0x20 || byte == 0x7F ? '?' : c;
  }
  return result + (length < text.size() ? "...\"" : "\"");
}

std::string found(std::string_view word) { return word.empty() ? "the end of the file" : shown(word); }

std::string shortNumber(double value) {
  char text[32];
  auto const end = std::to_chars(text, text + sizeof text, value, std::chars_format::general, 10).ptr;
  return {text, end};
}

}  // namespace talix
