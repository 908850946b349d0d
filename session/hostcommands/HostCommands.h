// The program's own script commands: what a person does by hand in an interface, and files.
#pragma once

#include <vector>

#include "session/CommandRegistry.h"

namespace talix {

// All of them, in order; the caller holds the only reference to each. `registry` is what "help" tells of.
std::vector<Command*> makeHostCommands(CommandRegistry const& registry);

}  // namespace talix
