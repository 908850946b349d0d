// Events of a C3D file: those of its EVENT group and those of its header block.
#pragma once

#include <string>
#include <vector>

#include "io/Take.h"
#include "io/c3d/C3DBytes.h"
#include "io/c3d/C3DParameters.h"

namespace talix {

// An event of the header that the group has too (same label, same time) comes once.
std::vector<TakeEvent> readC3DEvents(C3DBytes const& bytes, C3DParameters const& parameters,
                                     std::vector<TakeNote>& notes);

// Adds the EVENT group; none without events.
void addC3DEvents(std::vector<TakeEvent> const& events, C3DParameters& parameters,
                  std::vector<TakeNote>& notes);

}  // namespace talix
