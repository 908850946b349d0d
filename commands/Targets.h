// Finding what a command works on. The database owns the modules. The messages differ from command to
// command, so the caller gives them.
#pragma once

#include "host/scene/Module.h"

// The module that a path names. Without one logs `badPath`, whose %s is the path, and answers null.
Module* moduleAt(HString const& path, char const* badPath);
