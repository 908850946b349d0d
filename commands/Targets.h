// Finding what a command works on. The database owns the modules. The messages differ from command to
// command, so the caller gives them.
#pragma once

#include "host/scene/Node.h"

// The module that a path names. Without one logs `badPath`, whose %s is the path, and returns null.
Module* moduleAt(HString const& path, char const* badPath);
// The node that a path names; modules of other kinds do not count. As above.
Node* nodeAt(HString const& path, char const* badPath);
