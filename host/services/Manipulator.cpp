#include "host/services/Manipulator.h"

namespace {

Manipulator::EToolType s_current = Manipulator::Select;

}  // namespace

Manipulator::EToolType Manipulator::getCurrentToolType() { return s_current; }

void Manipulator::setCurrentToolType(EToolType type) { s_current = type; }
