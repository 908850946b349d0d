// What people read about the commands: the list of all, and the page of one.
#pragma once

#include <string>

#include "session/CommandRegistry.h"

namespace talix {

// "-color integer integer integer"
std::string optionSyntax(CommandOption const& option);
// Whether each of two options says in its mask that it excludes the other: one side alone is not enough.
bool excludeEachOther(CommandOption const& a, CommandOption const& b);

// All commands by category, with their purposes. No line break at the end.
std::string commandList(CommandRegistry const& commands);
// Syntax, options, result and purpose of one. No line break at the end.
std::string commandPage(CommandRegistry::Entry const& entry);

}  // namespace talix
