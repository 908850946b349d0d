// Markers that are about to become roots and go on moving in the world as they do now.
#pragma once

#include <vector>

#include "host/scene/Marker.h"

// Changes the own motion of markers (parents before their children) so that as roots they are where they are
// now, in every clip and by default. It costs nothing below parents that stay at the origin.
//
// Below parents that stand still in a clip the keys stay and their values change. Below moving ones each
// channel gets keys, in the lowest layer, at its own key times and at those of the parents with the whole
// frames between. A measured marker gets no key where it was not seen, so that its gaps stay gaps; between
// its keys there it moves straight. The selection of keys is kept. In a blend of clips motion is kept only
// below parents that stand still.
void keepMotionAsRoots(std::vector<Marker*> const& markers);
