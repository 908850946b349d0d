#include "session/ScriptRunner.h"

#include <algorithm>
#include <boost/json.hpp>
#include <cerrno>
#include <cstring>
#include <filesystem>
#include <fstream>

#include "io/FileError.h"
#include "session/JsonForms.h"
#include "session/JsonText.h"
#include "session/ScriptText.h"

namespace talix {

bool ScriptRunner::runText(std::string_view text, std::string const& file, int firstLine) {
  for (int number = firstLine; !text.empty(); ++number) {
    size_t const end = text.find('\n');
    if (!runLine(text.substr(0, end), file, number)) return false;
    text.remove_prefix(end == std::string_view::npos ? text.size() : end + 1);
  }
  return true;
}

bool ScriptRunner::runLine(std::string_view line, std::string const& file, int number) {
  LineResult const& result = m_session.run(line);
  if (result.outcome == LineResult::Outcome::Blank) return true;
  report(result, file, number);
  note(result);
  if (m_style.flushLines) std::fflush(m_out);
  return mayGoOn();
}

void ScriptRunner::note(LineResult const& result) {
  if (!result.failed()) return;
  m_torn |= result.torn;
  if (m_status != Status::Done && !m_torn) return;
  m_status = result.outcome == LineResult::Outcome::OutOfMemory  ? Status::OutOfMemory
             : result.outcome == LineResult::Outcome::FileFailed ? Status::FileFailed
                                                                 : Status::CommandFailed;
}

bool ScriptRunner::runSilently(std::string_view line) {
  LineResult const& result = m_session.run(line);
  writeLogLines(result, "");
  if (result.outcome == LineResult::Outcome::OutOfMemory) note(result);
  return !result.failed();
}

bool ScriptRunner::mayGoOn() const {
  return !std::ferror(m_out) && !m_torn && (m_status == Status::Done || m_style.keepGoing);
}

bool ScriptRunner::finish() { return std::fflush(m_out) == 0 && !std::ferror(m_out); }

void ScriptRunner::report(LineResult const& result, std::string const& file, int number) {
  m_text.clear();
  if (m_style.json) {
    boost::json::object object{{"file", mendedUtf8(file)}, {"line", number}};
    for (auto& [key, value] : toJson(result)) object.emplace(key, std::move(value));
    m_text = jsonText(object);
  } else {
    writeLogLines(result,
                  m_style.nameLines ? file + ", line " + std::to_string(number) + ": " : std::string());
    if (result.value.getType() == Variable::None) return;
    appendText(result.value, m_text);
  }
  m_text += '\n';
  std::fwrite(m_text.data(), 1, m_text.size(), m_out);
}

void ScriptRunner::writeLogLines(LineResult const& result, std::string const& where) {
  if (result.log.empty()) return;
  // Results of earlier lines come first where both streams go to one place.
  std::fflush(m_out);
  for (LogLine const& line : result.log) {
    std::fprintf(m_err, "%s: %s%s\n", getLogLevelName(line.level),
                 line.level == LogLevel::Error ? where.c_str() : "", line.text.c_str());
  }
}

bool usesUndo(std::string_view script) {
  static constexpr std::string_view blanks = " \t\r";
  while (!script.empty()) {
    size_t const end = std::min(script.find('\n'), script.size());
    std::string_view line = script.substr(0, end);
    line.remove_prefix(std::min(line.find_first_not_of(blanks), line.size()));
    std::string_view const name = line.substr(0, line.find_first_of(blanks));
    if (name == "undo" || name == "redo") return true;
    script.remove_prefix(std::min(end + 1, script.size()));
  }
  return false;
}

std::string readScript(std::string const& path) {
  std::error_code error;
  if (std::filesystem::is_directory(path, error)) throw FileError(path, "a folder, not a script");
  std::ifstream file(path, std::ios::binary);
  if (!file) throw FileError(path, std::string("the script cannot be opened: ") + std::strerror(errno));
  std::string text(std::istreambuf_iterator<char>(file), {});
  if (file.bad()) throw FileError(path, std::string("the script cannot be read: ") + std::strerror(errno));
  if (text.starts_with("\xef\xbb\xbf")) text.erase(0, 3);
  return text;
}

}  // namespace talix
