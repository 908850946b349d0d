// What arguments a command accepts, found out by asking it: a command says no more of them than yes and no.
#pragma once

#include <string>

#include "host/command/Command.h"

namespace talix {

// "string vector", "string [string ...]": the types by place, those in brackets may be left out. Forms that
// do not differ in their length alone stand with " or " between them; "none" when only an empty list is
// accepted. Takes each place to accept its types whatever stands in the others.
std::string acceptedArguments(Command const& command);

}  // namespace talix
