// How setProperty writes one attribute of any kind.
#pragma once

#include "commands/ChannelValues.h"
#include "host/scene/Attribute.h"

// The arguments are the property's name and the value; `command` is the name that messages give. False when
// the value does not fit the kind or is not taken; only some kinds say why.
[[nodiscard]] bool setAttribute(Attribute& attribute, Args const& args, Change const& change,
                                char const* command);
