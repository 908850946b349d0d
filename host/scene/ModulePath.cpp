#include "host/scene/ModulePath.h"

void ModulePath::setFromObject(Module const* module) { m_last = const_cast<Module*>(module); }

Module* ModulePath::pop() {
  Module* last = m_last;
  if (last) m_last = last->getParent();
  return last;
}

HString ModulePath::getFullPathString() const { return m_last ? m_last->getFullPathString() : HString(); }
