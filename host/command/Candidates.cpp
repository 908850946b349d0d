#include "host/command/Candidates.h"

bool Candidates::read(Given const& given, Options const& options) {
  for (CommandOption const& option : given) {
    int const index = option.getIndex();
    if (index == options.all) {
      m_among = Among::all;
    } else if (index == options.onMod) {
      m_onMod = moduleAt(option.getArg(0).getStringValue(-1));
      if (!m_onMod) return false;
    } else if (index == options.type) {
      char const* name = option.getArg(0).getStringValue(-1);
      m_class = HRuntimeClass::findClass(name);
      if (!m_class) {
        Command::logError("%s is not a Module type", name);  // kept: a class of any kind is accepted
        return false;
      }
    }
  }
  return true;
}

bool Candidates::exist(char const* noModules, char const* noSelection) const {
  if (countModules(m_among) > 0) return true;
  Command::logError("%s", m_among == Among::all ? noModules : noSelection);
  return false;
}
