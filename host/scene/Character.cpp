#include "host/scene/Character.h"

#include "host/scene/Database.h"
#include "host/scene/Setups.h"

H_DEFINE_CLASS(Character);

SolvingSetup* Character::getSolvingSetup(bool create) {
  for (int child = 0; child < getNumChildren(); ++child)
    if (auto* setup = objectAs<SolvingSetup>(static_cast<HObject*>(getChild(child)))) return setup;
  if (!create) return nullptr;
  return static_cast<SolvingSetup*>(
      getDatabase()->createModule(&SolvingSetup::s_classSolvingSetup, "Solving", this));
}
