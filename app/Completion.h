// Completion of the program's command line by bash.
#pragma once

#include <map>
#include <string>
#include <vector>

#include "session/CommandRegistry.h"

namespace talix {

// The options of each subcommand.
using Subcommands = std::map<std::string, std::vector<std::string>>;

// A script for bash: subcommands, their options and files; names of script commands after "commands" and,
// with their options, in the lines of "-c".
std::string bashCompletion(Subcommands const& subcommands, CommandRegistry const& commands);

}  // namespace talix
