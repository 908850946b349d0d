// Reads text files word by word or line by line, and knows the line it is at.
//
// Lines end with LF, CRLF or a lone CR; a UTF-8 byte order mark at the start is skipped. Words and lines are
// views into the file's bytes and live as long as these.
#pragma once

#include <optional>
#include <string>
#include <string_view>

#include "host/base/Types.h"
#include "io/FileBytes.h"

namespace talix {

class TextScanner {
 public:
  explicit TextScanner(FileBytes const& bytes);

  // The line, from 1, and the place in the file of what is read next.
  int64 line() const { return m_line; }
  size_t offset() const { return m_at; }
  size_t remaining() const { return m_text.size() - m_at; }

  // Words end at white space; "{" and "}" are words of their own. Empty at the end of the file.
  std::string_view takeWord();
  std::string_view peekWord();
  // Skips white space; true when nothing follows.
  bool atEnd();
  // True when nothing but blanks is left on this line.
  bool atLineEnd();
  // Skips white space and, when the text goes on with `lowerCase` in any case, that too.
  bool accept(std::string_view lowerCase);
  // What is left of this line before a brace, without blanks around it; the line's end stays unread.
  std::string_view takeRestOfLine();
  // The next word as a finite number; else throws FileError saying what was expected.
  double takeNumber(char const* expected);
  // A whole line without its end; false at the end of the file. Afterwards line() is the line after it.
  bool takeLine(std::string_view& text);

  // Throws FileError at the current line, or at a line.
  [[noreturn]] void fail(std::string const& what) const { failAt(m_line, what); }
  [[noreturn]] void failAt(int64 line, std::string const& what) const;

 private:
  void skipWhite();
  void skipBlanks();

  FileBytes const& m_bytes;
  std::string_view m_text;
  size_t m_at = 0;
  int64 m_line = 1;
};

// The number that a whole word is: decimals and exponents, a leading "+" too, also "nan" and "inf"; infinite
// when too large for a double. Nothing when the word is no number.
std::optional<double> parseNumber(std::string_view word);

std::string_view trimmed(std::string_view text);
bool equalsIgnoringCase(std::string_view text, std::string_view lowerCase);
bool startsIgnoringCase(std::string_view text, std::string_view lowerCase);
// For error texts: in quotes, cut when long, unprintable bytes as "?".
std::string shown(std::string_view text);
// For error texts: shown(word), or "the end of the file" when empty.
std::string found(std::string_view word);
// A number as short as it can be told apart, for notes and errors.
std::string shortNumber(double value);

}  // namespace talix
