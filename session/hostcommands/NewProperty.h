// Names for new properties of modules.
#pragma once

#include "host/scene/Module.h"

namespace talix {

// Whether a module has no property of that name, and `obstacle` is empty: why the name cannot be that of
// `what`. Else logs why.
bool isNewProperty(Module const& module, HString const& name, char const* what, HString const& obstacle);

}  // namespace talix
