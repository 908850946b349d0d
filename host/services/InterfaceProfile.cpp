// The profile of the interface object.
#include <charconv>
#include <cmath>
#include <filesystem>
#include <string>

#include "host/base/FileLock.h"
#include "host/base/Log.h"
#include "host/services/HInterface.h"

namespace {

// What to say is empty when nothing went wrong.
bool warned(std::string const& problem) {
  if (!problem.empty()) writeLog(LogLevel::Warning, problem);
  return !problem.empty();
}

template <class Number>
std::string textOf(Number value) {
  char digits[40];
  auto const end = std::to_chars(digits, digits + sizeof digits, value);
  return std::string(digits, end.ptr);
}

template <class Number>
std::optional<Number> numberIn(std::string const& text) {
  Number value{};
  char const* end = text.data() + text.size();
  auto const read = std::from_chars(text.data(), end, value);
  if (text.empty() || read.ec != std::errc() || read.ptr != end) return std::nullopt;
  if constexpr (std::is_floating_point_v<Number>)
    if (!std::isfinite(value)) return std::nullopt;
  return value;
}

std::string atEntry(char const* section, char const* entry, std::string const& text) {
  return std::string("Profile value ") + section + " " + entry + " is \"" + text + "\", ";
}

// The number in a text; the other one, with a warning, when it is none or below the least.
template <class Number>
Number numberOr(std::string const& text, char const* section, char const* entry, Number byDefault,
                std::optional<Number> least = std::nullopt) {
  std::optional<Number> const number = numberIn<Number>(text);
  if (number && (!least || *number >= *least)) return *number;
  std::string wanted = std::is_integral_v<Number> ? "not a whole number" : "not a number";
  if (least) wanted += " of at least " + textOf(*least);
  warned(atEntry(section, entry, text) + wanted + "; " + textOf(byDefault) + " is used");
  return byDefault;
}

template <class Known>
auto knownNumber(std::optional<std::string> const& text, Known const& known) {
  return text ? numberOr(*text, known.section, known.entry, known.byDefault, std::optional(known.least))
              : known.byDefault;
}

template <class Known>
std::optional<std::string> defaultIn(Known const& table, HString const& section, HString const& entry) {
  for (auto const& known : table)
    if (section == known.section && entry == known.entry) return textOf(known.byDefault);
  return std::nullopt;
}

}  // namespace

std::optional<std::string> HInterface::findProfileText(HString const& section, HString const& entry,
                                                       HString const& file) const {
  HLock const lock(m_section);
  if (!file.IsEmpty()) {
    Profile other;
    // Without a file there is no entry, which is no reason to complain.
    std::error_code error;
    if (std::filesystem::exists(file.GetString(), error) && warned(other.read(file.GetString())))
      return std::nullopt;
    return other.find(section.GetString(), entry.GetString());
  }
  if (auto text = m_profile.find(section.GetString(), entry.GetString())) return text;
  if (auto text = defaultIn(profile::kInts, section, entry)) return text;
  return defaultIn(profile::kDoubles, section, entry);
}

int HInterface::getProfileInt(HString const& section, HString const& entry, int byDefault,
                              HString const& file) const {
  auto const text = findProfileText(section, entry, file);
  return text ? numberOr(*text, section, entry, byDefault) : byDefault;
}

double HInterface::getProfileDouble(HString const& section, HString const& entry, double byDefault,
                                    HString const& file) const {
  auto const text = findProfileText(section, entry, file);
  return text ? numberOr(*text, section, entry, byDefault) : byDefault;
}

bool HInterface::getProfileBool(HString const& section, HString const& entry, bool byDefault,
                                HString const& file) const {
  auto const text = findProfileText(section, entry, file);
  if (!text) return byDefault;
  for (char const* yes : {"true", "on", "yes", "1"})
    if (*text == yes) return true;
  for (char const* no : {"false", "off", "no", "0"})
    if (*text == no) return false;
  warned(atEntry(section, entry, *text) + "neither true nor false; " + (byDefault ? "true" : "false") +
         " is used");
  return byDefault;
}

HString HInterface::getProfileString(HString const& section, HString const& entry, HString const& byDefault,
                                     HString const& file) const {
  auto const text = findProfileText(section, entry, file);
  return text ? HString(*text) : byDefault;
}

int HInterface::getProfile(ProfileInt const& known) const {
  HLock const lock(m_section);
  return knownNumber(m_profile.find(known.section, known.entry), known);
}

double HInterface::getProfile(ProfileDouble const& known) const {
  HLock const lock(m_section);
  return knownNumber(m_profile.find(known.section, known.entry), known);
}

bool HInterface::writeProfileInt(HString const& section, HString const& entry, int value,
                                 HString const& file) {
  return writeProfileString(section, entry, textOf(value), file);
}

bool HInterface::writeProfileDouble(HString const& section, HString const& entry, double value,
                                    HString const& file) {
  return writeProfileString(section, entry, textOf(value), file);
}

bool HInterface::writeProfileBool(HString const& section, HString const& entry, bool value,
                                  HString const& file) {
  return writeProfileString(section, entry, value ? "true" : "false", file);
}

bool HInterface::writeProfileString(HString const& section, HString const& entry, HString const& value,
                                    HString const& file) {
  HLock const lock(m_section);
  auto const setIn = [&](Profile& profile) {
    if (profile.set(section.GetString(), entry.GetString(), value.GetString())) return true;
    warned("A profile cannot hold the entry \"" + entry.GetString() + "\" in the section \"" +
           section.GetString() + "\" with this value");
    return false;
  };
  std::string const& target = file.IsEmpty() ? m_profileFile : file.GetString();
  if (file.IsEmpty() && !setIn(m_profile)) return false;
  if (target.empty()) return true;

  // What others have written there meanwhile stays, and a file that cannot be read is not overwritten. Nobody
  // writes between reading and writing.
  FileLock const fileLock(target);
  Profile stored;
  std::error_code error;
  if (std::filesystem::exists(target, error) && warned(stored.read(target))) return false;
  return setIn(stored) && !warned(stored.write(target));
}

bool HInterface::loadProfile(HString const& path) {
  HLock const lock(m_section);
  m_profileFile.clear();
  std::error_code error;
  if (std::filesystem::exists(path.GetString(), error) && warned(m_profile.read(path.GetString())))
    return false;
  m_profileFile = path.GetString();
  return true;
}

bool HInterface::saveProfile(HString const& path) const {
  HLock const lock(m_section);
  return !warned(m_profile.write(path.GetString()));
}
