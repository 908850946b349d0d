// What people read about the commands: the list of all, and the page of one.
#pragma once

#include <string>
#include <vector>

#include "session/CommandRegistry.h"

namespace talix {

// The commands of one category, "Data Editing / Data Retrieval", in the order of the registry.
struct CommandGroup {
  std::string category;
  std::vector<CommandRegistry::Entry const*> entries;
};
// In the order of their first commands.
std::vector<CommandGroup> groupsOf(CommandRegistry const& commands);

// "-color integer integer integer"
std::string optionSyntax(CommandOption const& option);
// Whether each of two options says in its mask that it excludes the other: one side alone is not enough.
bool excludeEachOther(CommandOption const& a, CommandOption const& b);

// "setKey "propertyType" value1 ... [-t integer] [-r]"
std::string usageOf(Command const& command);

// All commands by category, with their purposes. No line break at the end.
std::string commandList(CommandRegistry const& commands);
// All that is said of one. No line break at the end.
std::string commandPage(CommandRegistry::Entry const& entry);

}  // namespace talix
