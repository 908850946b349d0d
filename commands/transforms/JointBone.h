// The bone that the joint and hinge commands work on.
#pragma once

#include "host/scene/Bones.h"

// The first selected labelling bone. Null, with a message, without one. The scene owns it.
LabelingBone* selectedLabelingBone();
