// How a module keeps its children.
#pragma once

#include "host/scene/Marker.h"

// Children in order; the nodes and the markers among them once more, so that these are found as fast.
struct Module::Children {
  OrderedList<Module, &Module::m_childSlot> all;
  OrderedList<Module, &Module::m_nodeChildSlot> nodes;
  OrderedList<Module, &Module::m_markerChildSlot> markers;

  template <class Edit>
  void editFor(Module* child, Edit edit) {
    edit(all);
    if (child->isKindOf(&Node::s_classNode)) edit(nodes);
    if (child->isKindOf(&Marker::s_classMarker)) edit(markers);
  }
};
