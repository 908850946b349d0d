#include "host/services/Profile.h"

#include <boost/property_tree/ini_parser.hpp>
#include <cerrno>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <system_error>

#include "host/base/ReplaceFile.h"

namespace {

using boost::property_tree::ptree;

std::string_view trimmed(std::string_view text) {
  constexpr std::string_view kBlanks = " \t\v\f";
  size_t const first = text.find_first_not_of(kBlanks);
  if (first == std::string_view::npos) return {};
  return text.substr(first, text.find_last_not_of(kBlanks) - first + 1);
}

bool isOneLine(std::string_view text) {
  return text.find_first_of(std::string_view("\r\n\0", 3)) == std::string_view::npos;
}

// A child by its whole name, in which dots have no meaning; made when there is none.
ptree& childNamed(ptree& parent, std::string_view name) {
  std::string const key(name);
  auto const child = parent.find(key);
  return child != parent.not_found() ? child->second : parent.push_back({key, ptree()})->second;
}

}  // namespace

struct Profile::Tree {
  ptree sections;
};

Profile::Profile() : m_tree(std::make_unique<Tree>()) {}
Profile::Profile(Profile&&) noexcept = default;
Profile& Profile::operator=(Profile&&) noexcept = default;
Profile::~Profile() = default;

std::optional<std::string> Profile::find(std::string_view section, std::string_view entry) const {
  ptree const& sections = m_tree->sections;
  auto const inside = sections.find(std::string(trimmed(section)));
  if (inside == sections.not_found()) return std::nullopt;
  auto const found = inside->second.find(std::string(trimmed(entry)));
  if (found == inside->second.not_found()) return std::nullopt;
  return found->second.data();
}

bool Profile::set(std::string_view section, std::string_view entry, std::string_view value) {
  section = trimmed(section);
  entry = trimmed(entry);
  value = trimmed(value);
  if (section.empty() || entry.empty() || !isOneLine(section) || !isOneLine(entry) || !isOneLine(value) ||
      section.find(']') != std::string_view::npos || entry.find('=') != std::string_view::npos ||
      std::string_view("[#;").find(entry.front()) != std::string_view::npos)
    return false;
  ptree& inside = childNamed(m_tree->sections, section);
  if (!inside.data().empty()) return false;  // an entry of that name stands outside all sections
  childNamed(inside, entry).data() = value;
  return true;
}

std::string Profile::read(std::string const& file) {
  std::error_code error;
  if (std::filesystem::is_directory(file, error)) return file + ": is a folder, not a file";
  std::ifstream in(file);
  if (!in) return file + ": cannot be read: " + std::strerror(errno);
  try {
    boost::property_tree::read_ini(in, m_tree->sections);
  } catch (boost::property_tree::ini_parser_error const& problem) {
    return file + ", line " + std::to_string(problem.line()) + ": " + problem.message();
  }
  return {};
}

std::string Profile::write(std::string const& file) const {
  std::filesystem::path const folder = std::filesystem::path(file).parent_path();
  try {
    if (!folder.empty()) std::filesystem::create_directories(folder);
    replaceFile(file, [this](std::ostream& out) { boost::property_tree::write_ini(out, m_tree->sections); });
  } catch (std::system_error const& error) {
    return file + ": cannot be written: " + error.code().message();
  } catch (boost::property_tree::ini_parser_error const& problem) {
    return file + ": cannot be written: " + problem.message();
  }
  return {};
}
