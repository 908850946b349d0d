// The script commands as a section of a manual page.
#pragma once

#include <string>

#include "session/CommandRegistry.h"

namespace talix {

// A text as roff reads it: no word in it is taken as a request or an escape.
std::string roffText(std::string const& text);

// "SCRIPT COMMANDS": what "talix commands NAME" tells of each, by category. Ends with a line break.
std::string manCommands(CommandRegistry const& commands);

}  // namespace talix
