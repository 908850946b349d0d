// Keys with which one node follows a point that is fixed to another.
#pragma once

#include "host/scene/Node.h"

// Keys of the translation of `follower` in a clip, with which it stays at `offset` (millimetres, in the space
// of `leader`) over a range: at every key time in the range of the leader and all above it, and of what is
// above the follower, at both ends of the range, and at whole frames between them where straight lines
// between keys would be more than 0.01 mm off. They bridge, since the point is known at all times. The keys
// of the follower itself are not looked at. Cost: linear in the frames between the first and the last of
// those key times.
KeyTrack followingKeys(Node const& follower, Node const& leader, Vec3 const& offset, NLEClip& clip,
                       HTimeRange const& range);
