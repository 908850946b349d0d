// Virtual markers of a solving bone.
//
// "BONE_virtA" and "BONE_virtB" lie on either side of a child joint, a quarter of the bone's length away from
// it; "BONE_virt", on demand, lies in the bone's own joint, so that the three tell the whole pose of the
// bone. They stand below the bone's character, else at the root. Each is tied to the bone by a solving
// constraint below the character's solving setup, and keyed over the animation range to where its constraint
// wants it. Of several children with a length the last decides.
#pragma once

#include <vector>

#include "host/scene/Bones.h"
#include "host/scene/Marker.h"

// Markers that were there before under their names are used again. Markers that were created are added to
// `created`. False, without a new marker, when another module has a marker's name (with a message) or there
// is nothing to make: no solving bone below it has a length.
[[nodiscard]] bool makeBoneVirtuals(SolvingBone& bone, bool withJoint, std::vector<Marker*>& created);
