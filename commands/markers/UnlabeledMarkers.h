// What packing and unpacking share.
#pragma once

#include "host/scene/Database.h"
#include "host/scene/Marker.h"

// In the order of selection.
inline TSimpleArray<Marker*> selectedUnlabeledMarkers() {
  TSimpleArray<Marker*> markers;
  for (int i = 0; i < g_db->getNumSelectedMarkers(); ++i)
    if (Marker* marker = g_db->getSelectedMarker(i); marker->isUnlabeled()) markers.add(marker);
  return markers;
}
