#include "session/ScriptLine.h"

#include <algorithm>
#include <cmath>

#include "session/ScriptText.h"

namespace talix {

namespace {

// Characters, from 1: bytes that continue a UTF-8 character do not count.
size_t columnOf(std::string_view line, size_t at) {
  auto const continues = [](char c) { return (static_cast<unsigned char>(c) & 0xc0) == 0x80; };
  std::string_view const before = line.substr(0, at);
  return before.size() - static_cast<size_t>(std::count_if(before.begin(), before.end(), continues)) + 1;
}

CommandOption const* findOption(Command const& command, std::string_view name) {
  for (int i = 0; i < command.getNumOptions(); ++i)
    if (command.getOption(i).getName().GetString() == name) return &command.getOption(i);
  return nullptr;
}

// A value as another type, where nothing is lost.
bool convert(Variable& value, Variable::VarType type) {
  Variable::VarType const own = value.getType();
  if (own == type || type == Variable::None) return true;
  if (type == Variable::Float && own == Variable::Int) {
    value.setValue(value.getFloatValue(-1), -1);
    return true;
  }
  if (type == Variable::Int && own == Variable::Float) {
    double const number = value.getFloatValue(-1);
    if (number != std::trunc(number) || std::abs(number) > INT32_MAX) return false;
    value.setValue(static_cast<int>(number), -1);
    return true;
  }
  if (type == Variable::Bool && own == Variable::Int) {
    int const number = value.getIntValue(-1);
    if (number < Variable::False || number > Variable::Toggle) return false;
    value.setValue(static_cast<Variable::BoolType>(number), -1);
    return true;
  }
  return false;
}

Variable arrayOf(std::vector<Variable> const& elements) {
  if (elements.empty()) return Variable(Variable::StringArray, 0);
  Variable::VarType const type = elements.front().getType();
  Variable array(static_cast<Variable::VarType>(type + Variable::kArray), static_cast<int>(elements.size()));
  for (int i = 0; i < static_cast<int>(elements.size()); ++i) {
    Variable const& element = elements[static_cast<size_t>(i)];
    if (type == Variable::String) {
      array.setValue(element.getStringValue(-1), i);
    } else if (type == Variable::Vector) {
      array.setValue(element.getVecValue(-1), i);
    } else {
      array.setValue(element.getFloatValue(-1), i);
    }
  }
  return array;
}

}  // namespace

ScriptLine::Outcome ScriptLine::read(std::string_view line, CommandRegistry const& commands) {
  m_line = line;
  m_at = 0;
  m_command = nullptr;
  m_name.clear();
  m_args.clear();
  m_options.clear();
  if (!skipToToken()) return Outcome::Blank;
  if (size_t const zero = line.find('\0'); zero != std::string_view::npos) {
    refuse(zero, "a zero byte cannot be part of a script");
    return Outcome::Refused;
  }
  m_name = takeWord(false);
  CommandRegistry::Entry const* entry = commands.find(m_name);
  if (!entry) {
    m_problem = "Unknown command: " + m_name;
    return Outcome::Refused;
  }
  m_command = entry->command;
  while (skipToToken()) {
    if (startsOption()) {
      if (!readOption()) return Outcome::Refused;
      continue;
    }
    Variable value;
    if (!readValue(value, false)) return Outcome::Refused;
    m_args.add(std::move(value));
  }
  return Outcome::Command;
}

bool ScriptLine::skipToToken() {
  while (!atEnd() && isBlank(m_line[m_at])) ++m_at;
  return !atEnd() && m_line[m_at] != '#';
}

bool ScriptLine::startsOption() const {
  return m_line[m_at] == '-' && m_at + 1 < m_line.size() && isLetter(m_line[m_at + 1]);
}

std::string_view ScriptLine::takeWord(bool inArray) {
  size_t const start = m_at;
  while (!atEnd() && !isBlank(m_line[m_at]) && !(inArray && m_line[m_at] == ']')) ++m_at;
  return m_line.substr(start, m_at - start);
}

bool ScriptLine::readOption() {
  std::string_view const name = takeWord(false).substr(1);
  CommandOption const* declared = findOption(*m_command, name);
  if (!declared) {
    m_problem = "Unknown option -" + std::string(name) + " for " + m_name;
    return false;
  }
  m_options.add(*declared);
  CommandOption& given = m_options[m_options.getCount() - 1];
  for (int i = 0; i < declared->getArgCount(); ++i) {
    Variable value;
    if (!readOptionValue(*declared, value)) return false;
    given.setArg(i, value);
  }
  return true;
}

bool ScriptLine::readOptionValue(CommandOption const& option, Variable& out) {
  if (!skipToToken() || startsOption()) return refuseOptionValue(option);
  char const first = m_line[m_at];
  bool const isWord = first != '"' && first != '\'' && first != '<' && first != '[';
  if (isWord && option.getType() == Variable::String) {
    setText(out, takeWord(false));
    return true;
  }
  return readValue(out, false) && (convert(out, option.getType()) || refuseOptionValue(option));
}

bool ScriptLine::readValue(Variable& out, bool inArray) {
  switch (m_line[m_at]) {
    case '"':
    case '\'':
      return readString(out, inArray);
    case '<':
      return readVector(out, inArray);
    case '[':
      if (inArray) return refuse(m_at, "an array cannot hold arrays");
      return readArray(out);
    default:
      return readWordValue(out, inArray);
  }
}

bool ScriptLine::readWordValue(Variable& out, bool inArray) {
  size_t const start = m_at;
  std::string_view const text = takeWord(inArray);
  Word const word = readWord(text);
  switch (word.kind) {
    case Word::String:
      setText(out, text);
      return true;
    case Word::Int:
      out.setValue(word.integer, -1);
      return true;
    case Word::Float:
      out.setValue(word.number, -1);
      return true;
    case Word::Bool:
      out.setValue(word.boolean, -1);
      return true;
    case Word::NotFinite:
      return refuseWord(start, text, "is not a finite number (quote it to mean a string)");
    case Word::IntTooLarge:
      return refuseWord(start, text, "is an integer beyond 32 bits");
    case Word::FloatOutOfRange:
      return refuseWord(start, text, "is beyond the range of a float");
  }
  return false;
}

bool ScriptLine::readString(Variable& out, bool inArray) {
  size_t const start = m_at;
  char const quote = m_line[m_at++];
  m_text.clear();
  while (true) {
    size_t const end = m_line.find(quote, m_at);
    if (end == std::string_view::npos) return refuse(start, "a string without its closing quote");
    m_text.append(m_line, m_at, end - m_at);
    m_at = end + 1;
    if (atEnd() || m_line[m_at] != quote) break;
    m_text += quote;
    ++m_at;
  }
  out.setValue(m_text.c_str(), -1);
  return endValue(inArray);
}

bool ScriptLine::readVector(Variable& out, bool inArray) {
  size_t const start = m_at++;
  Vec3 vector;
  for (int i = 0; i < 3; ++i) {
    if (i > 0 && skipToToken() && m_line[m_at] == ',') ++m_at;
    if (!skipToToken() || m_line[m_at] == '>') return refuse(start, "a vector holds three numbers");
    if (!readComponent(vector[i])) return false;
  }
  if (!skipToToken()) return refuse(start, "a vector without its closing >");
  if (m_line[m_at] != '>') return refuse(m_at, "a vector holds three numbers; > is expected here");
  ++m_at;
  out.setValue(vector, -1);
  return endValue(inArray);
}

bool ScriptLine::readComponent(double& out) {
  size_t const start = m_at;
  while (!atEnd() && !isBlank(m_line[m_at]) && m_line[m_at] != ',' && m_line[m_at] != '>') ++m_at;
  std::string_view const text = m_line.substr(start, m_at - start);
  if (text.empty()) return refuse(start, "a number is expected here");
  Word word = readWord(text);
  if (word.kind == Word::IntTooLarge) {
    // Components are floats, whatever they look like.
    word = readWord(m_text.assign(text).append("."));
  }
  out = word.kind == Word::Int ? word.integer : word.number;
  if (word.kind == Word::Int || word.kind == Word::Float) return true;
  if (word.kind == Word::FloatOutOfRange) return refuseWord(start, text, "is beyond the range of a float");
  return refuseWord(start, text, "is not a number; a vector holds three");
}

bool ScriptLine::readArray(Variable& out) {
  size_t const start = m_at++;
  m_elements.clear();
  while (skipToToken() && m_line[m_at] != ']') {
    size_t const place = m_at;
    Variable element;
    if (!readValue(element, true)) return false;
    if (!m_elements.empty() && element.getType() != m_elements.front().getType()) {
      return refuse(place, "an array holds one type of value; this " + typeName(element.getType()) +
                               " stands in an array of type " + typeName(m_elements.front().getType()));
    }
    m_elements.push_back(std::move(element));
  }
  if (atEnd() || m_line[m_at] != ']') return refuse(start, "an array without its closing ]");
  ++m_at;
  out = arrayOf(m_elements);
  return endValue(false);
}

bool ScriptLine::endValue(bool inArray) {
  if (atEnd() || isBlank(m_line[m_at]) || (inArray && m_line[m_at] == ']')) return true;
  return refuse(m_at, "a blank is expected after the value");
}

void ScriptLine::setText(Variable& out, std::string_view text) {
  m_text = text;
  out.setValue(m_text.c_str(), -1);
}

bool ScriptLine::refuse(size_t at, std::string const& what) {
  m_problem = "Column " + std::to_string(columnOf(m_line, at)) + ": " + what;
  return false;
}

bool ScriptLine::refuseWord(size_t at, std::string_view word, char const* why) {
  return refuse(at, std::string(word) + " " + why);
}

bool ScriptLine::refuseOptionValue(CommandOption const& option) {
  m_problem = "Option -" + option.getName().GetString() + " of " + m_name + " needs " +
              std::to_string(option.getArgCount()) + " " + typeName(option.getType());
  return false;
}

}  // namespace talix
