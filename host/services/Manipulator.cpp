#include "host/services/Manipulator.h"

#include "host/services/SceneServices.h"

Manipulator::EToolType Manipulator::getCurrentToolType() { return SceneServices::getCurrent().tool; }

void Manipulator::setCurrentToolType(EToolType type) { SceneServices::getCurrent().tool = type; }
