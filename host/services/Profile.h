// Settings as an INI file holds them: texts by section and entry.
#pragma once

#include <memory>
#include <optional>
#include <string>
#include <string_view>

class Profile {
 public:
  Profile();
  Profile(Profile&&) noexcept;
  Profile& operator=(Profile&&) noexcept;
  ~Profile();

  std::optional<std::string> find(std::string_view section, std::string_view entry) const;
  // Blanks around the three are dropped. False, with nothing changed, when a file could not hold them: a line
  // break, an empty section or entry, "]" in a section, "=" in an entry or a leading "[", "#" or ";" there.
  [[nodiscard]] bool set(std::string_view section, std::string_view entry, std::string_view value);

  // Both return what went wrong, "FILE, line N: WHAT" or "FILE: WHAT"; empty: nothing. A file that cannot be
  // read leaves the values as they were. Writing keeps what was read: entries, their order and comments.
  [[nodiscard]] std::string read(std::string const& file);
  // A temporary file is renamed over the old one; missing folders are made.
  [[nodiscard]] std::string write(std::string const& file) const;

 private:
  struct File;
  std::unique_ptr<File> m_file;
};
