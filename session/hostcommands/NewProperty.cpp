#include "session/hostcommands/NewProperty.h"

#include "host/command/Command.h"

namespace talix {

bool isNewProperty(Module const& module, HString const& name, char const* what, HString const& obstacle) {
  if (module.getProperty(name) || module.getAttribute(name.GetStr()))
    Command::logError("Module %s already has a property named %s.", module.getName().GetStr(), name.GetStr());
  else if (!obstacle.IsEmpty())
    Command::logError("\"%s\" cannot be the name of %s: %s.", name.GetStr(), what, obstacle.GetStr());
  else
    return true;
  return false;
}

}  // namespace talix
