#include "session/CommandRegistry.h"

#include <stdexcept>

namespace talix {

void CommandRegistry::add(Command* command, std::string const& source) {
  std::string const& name = command->getName().GetString();
  auto const [place, added] = m_byName.emplace(name, m_entries.size());
  if (!added) {
    throw std::runtime_error("Two commands are named " + name + ": one of " +
                             m_entries[place->second].source + ", one of " + source);
  }
  m_entries.push_back({command, source});
}

CommandRegistry::Entry const* CommandRegistry::find(std::string_view name) const {
  auto const found = m_byName.find(name);
  return found == m_byName.end() ? nullptr : &m_entries[found->second];
}

std::string argSyntax(Command const& command) {
  HString syntax;
  command.getArgSyntaxString(syntax);
  return syntax.GetString();
}

}  // namespace talix
