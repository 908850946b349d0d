// The page of all commands, as it is checked in (docs/commands.md).
#pragma once

#include <functional>
#include <string>

#include "session/CommandRegistry.h"

namespace talix {

// Markdown, by category, with what readers, interfaces and checks of it want to know of each command. No line
// break at the end.
std::string registryPage(CommandRegistry const& commands,
                         std::function<bool(std::string const& name)> const& isForDevelopers);

}  // namespace talix
