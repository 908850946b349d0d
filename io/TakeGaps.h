// Where the points of a take were not seen.
#pragma once

#include "io/Take.h"

namespace talix {

// In frames of the take. What is missing before the first and after the last position counts as a gap.
struct TakeGaps {
  int64 missing = 0;  // frames without a position
  int64 count = 0;    // runs of them
  int64 longest = 0;  // frames of the longest run
};

TakeGaps gapsOf(Take const&, KeyTrack const& positions);

}  // namespace talix
