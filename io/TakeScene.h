// Takes into the scene and out of it.
#pragma once

#include <vector>

#include "host/scene/Database.h"
#include "io/TakeSource.h"

namespace talix {

// Adds a take to the scene as a new clip, which becomes active, and modules. A subject, marker or bone that
// the scene already has under its name gets the take's motion in the new clip instead of a double. The first
// take sets rate, ranges and up axis; `up` (0 x, 1 y, 2 z; -1: as it is) sets the scene's up axis first. A
// take with another up axis than the scene's is turned.
//
// Every conversion and assumption is a line of `notes`, the take's own included. Throws FileError, with the
// scene as it was, when the take cannot be added (32nd clip, channel kinds that clash beyond mending).
void importTake(Take take, std::string const& path, int up, Database& scene, std::vector<TakeNote>& notes);

// The active clip of the scene (the default values when none is active) as a take over the frames that saving
// takes, one value a frame. It reads from the scene, which must outlive it and stay as it is meanwhile. What
// a take cannot hold is added to `notes` as a warning.
TakeSource exportTake(Database& scene, std::vector<TakeNote>& notes);

}  // namespace talix
