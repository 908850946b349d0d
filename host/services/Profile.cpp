#include "host/services/Profile.h"

#define SI_IMPLEMENTATION
#define SI_NO_CONVERSION
#include <SimpleIni.h>
#include <algorithm>
#include <cerrno>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <system_error>

#include "host/base/ReplaceFile.h"

namespace {

std::string_view trimmed(std::string_view text) {
  constexpr std::string_view kBlanks = " \t\v\f\r";
  size_t const first = text.find_first_not_of(kBlanks);
  if (first == std::string_view::npos) return {};
  return text.substr(first, text.find_last_not_of(kBlanks) - first + 1);
}

bool isOneLine(std::string_view text) {
  return text.find_first_of(std::string_view("\r\n\0", 3)) == std::string_view::npos;
}

bool isComment(std::string_view line) { return line.starts_with(';') || line.starts_with('#'); }

// What is wrong with the content of a file, with the line; empty: nothing. SimpleIni reads over such lines,
// and writing would lose them.
std::string problemOf(std::string_view content) {
  int64_t line = 0;
  bool isOutside = true;
  while (!content.empty()) {
    ++line;
    size_t const end = std::min(content.find('\n'), content.size());
    std::string_view const text = trimmed(content.substr(0, end));
    content.remove_prefix(std::min(end + 1, content.size()));
    char const* problem = nullptr;
    if (text.empty() || isComment(text)) continue;
    if (text.front() == '[') {
      isOutside = false;
      if (trimmed(text.substr(1, text.find(']') - 1)).empty()) problem = "a section's name is missing";
      if (text.back() != ']') problem = "']' is missing at the end of the line";
    } else if (text.find('=') == std::string_view::npos) {
      problem = "'=' character not found in line";
    } else if (trimmed(text.substr(0, text.find('='))).empty()) {
      problem = "an entry's name is missing before '='";
    } else if (isOutside) {
      problem = "an entry stands before the first section";
    }
    if (problem) return ", line " + std::to_string(line) + ": " + problem;
  }
  return {};
}

// The comments after the last entry, which SimpleIni has no place for.
std::string commentsAtEnd(std::string_view content) {
  size_t from = content.size();
  bool any = false;
  while (from > 0) {
    size_t const start = content.substr(0, from - 1).rfind('\n') + 1;
    std::string_view const line = trimmed(content.substr(start, from - start - (content[from - 1] == '\n')));
    if (!line.empty() && !isComment(line)) break;
    any = any || !line.empty();
    from = start;
  }
  return any ? std::string(content.substr(from)) : std::string();
}

}  // namespace

struct Profile::File {
  struct Exactly {
    bool operator()(char const* a, char const* b) const { return std::strcmp(a, b) < 0; }
  };

  File() : ini(true, false, false) { ini.SetSpaces(false); }

  CSimpleIniTempl<char, Exactly, SI_ConvertA<char>> ini;
  std::string end;  // comments
};

Profile::Profile() : m_file(std::make_unique<File>()) {}
Profile::Profile(Profile&&) noexcept = default;
Profile& Profile::operator=(Profile&&) noexcept = default;
Profile::~Profile() = default;

std::optional<std::string> Profile::find(std::string_view section, std::string_view entry) const {
  std::string const inside(trimmed(section)), name(trimmed(entry));
  char const* value = m_file->ini.GetValue(inside.c_str(), name.c_str());
  return value ? std::optional<std::string>(value) : std::nullopt;
}

bool Profile::set(std::string_view section, std::string_view entry, std::string_view value) {
  std::string const inside(trimmed(section)), name(trimmed(entry)), text(trimmed(value));
  if (inside.empty() || name.empty() || !isOneLine(inside) || !isOneLine(name) || !isOneLine(text) ||
      inside.find(']') != std::string::npos || name.find('=') != std::string::npos || name[0] == '[' ||
      isComment(name))
    return false;
  if (m_file->ini.SetValue(inside.c_str(), name.c_str(), text.c_str()) < 0) throw std::bad_alloc();
  return true;
}

std::string Profile::read(std::string const& file) {
  std::error_code error;
  if (std::filesystem::is_directory(file, error)) return file + ": is a folder, not a file";
  std::ifstream in(file, std::ios::binary);
  if (!in) return file + ": cannot be read: " + std::strerror(errno);
  std::string const content(std::istreambuf_iterator<char>(in), {});
  std::string_view text = content;
  if (text.starts_with("\xEF\xBB\xBF")) text.remove_prefix(3);
  if (std::string const problem = problemOf(text); !problem.empty()) return file + problem;
  auto read = std::make_unique<File>();
  if (read->ini.LoadData(text.data(), text.size()) < 0) throw std::bad_alloc();
  read->end = commentsAtEnd(text);
  m_file = std::move(read);
  return {};
}

std::string Profile::write(std::string const& file) const {
  std::filesystem::path const folder = std::filesystem::path(file).parent_path();
  try {
    if (!folder.empty()) std::filesystem::create_directories(folder);
    std::string content;
    if (m_file->ini.Save(content) < 0) throw std::bad_alloc();
    // Two blank lines before each section, and one after it, are more than readers need.
    for (size_t at; (at = content.find("\n\n\n")) != std::string::npos;) content.erase(at, 1);
    content.erase(0, content.find_first_not_of('\n'));
    if (!m_file->end.empty()) content += (m_file->end.front() == '\n' ? "" : "\n") + m_file->end;
    replaceFile(file, [&](std::ostream& out) { out << content; });
  } catch (std::system_error const& error) {
    return file + ": cannot be written: " + error.code().message();
  }
  return {};
}
