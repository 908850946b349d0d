// The script commands of a program, in order: those of plug-ins first, then the host's own. Found by exact
// name. Does not own them.
#pragma once

#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "host/command/Command.h"

namespace talix {

class CommandRegistry {
 public:
  struct Entry {
    Command* command;
    std::string source;  // the plug-in's name, or "host"
  };

  // Throws std::runtime_error, and adds nothing, when a command of that name is there already.
  void add(Command* command, std::string const& source);

  // Null when there is none.
  Entry const* find(std::string_view name) const;
  std::vector<Entry> const& entries() const { return m_entries; }

 private:
  std::vector<Entry> m_entries;
  std::unordered_map<std::string_view, size_t> m_byName;  // the texts lie in the commands
};

// The argument syntax as help shows it; empty for the host's default.
std::string argSyntax(Command const& command);

}  // namespace talix
