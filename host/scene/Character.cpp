#include "host/scene/Character.h"

#include "host/scene/Database.h"
#include "host/scene/Setups.h"

H_DEFINE_CLASS(Character);

Marker* Character::getMarkerChild(int i) const {
  for (int child = 0; child < getNumNodeChildren(); ++child) {
    auto* marker = objectAs<Marker>(static_cast<HObject*>(getNodeChild(child)));
    if (marker && i-- == 0) return marker;
  }
  return nullptr;
}

int Character::getNumMarkerChildren() const {
  int count = 0;
  for (int child = 0; child < getNumNodeChildren(); ++child)
    if (getNodeChild(child)->isKindOf(&Marker::s_classMarker)) ++count;
  return count;
}

int Character::findMarkerChild(HString const& name) const {
  int index = 0;
  for (int child = 0; child < getNumNodeChildren(); ++child) {
    Node const* node = getNodeChild(child);
    if (!node->isKindOf(&Marker::s_classMarker)) continue;
    if (node->getName() == name) return index;
    ++index;
  }
  return -1;
}

SolvingSetup* Character::getSolvingSetup(bool create) {
  for (int child = 0; child < getNumChildren(); ++child)
    if (auto* setup = objectAs<SolvingSetup>(static_cast<HObject*>(getChild(child)))) return setup;
  if (!create) return nullptr;
  return static_cast<SolvingSetup*>(g_db->createModule(&SolvingSetup::s_classSolvingSetup, "Solving", this));
}
