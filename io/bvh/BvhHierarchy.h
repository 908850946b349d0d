// The first half of a BVH file: joints, their offsets and channels, without motion.
#pragma once

#include <vector>

#include "io/Take.h"
#include "io/TextScanner.h"
#include "io/bvh/BvhChannels.h"

namespace talix {

struct BvhHierarchy {
  std::vector<TakeJoint> joints;                  // offsets in file units, no keys
  std::vector<std::vector<BvhChannel>> channels;  // by joint
  size_t channelCount = 0;                        // values in a frame
  std::vector<TakeNote> notes;
};

// Deeper nesting is refused: scenes are walked joint by joint downwards.
inline constexpr size_t kDeepestBvhNesting = 500;

// Reads from the start of the file through the word MOTION. Throws FileError.
BvhHierarchy readBvhHierarchy(TextScanner&);

}  // namespace talix
