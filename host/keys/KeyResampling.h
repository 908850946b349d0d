// A curve with keys at the frames of another rate. Times do not move: what happened at a second still does.
//
// Keys that follow each other one frame apart or less, or are bridged, are a run: it gets a key at each new
// frame from its first to its last key, with the value that the curve has there (rotations by slerp or squad,
// switches and integers of constant channels by the value at or before). A run of components that are keyed
// apart is that of each component. Keys that stand alone, and runs between two new frames, go to the nearest
// new frame; of several that would meet there the nearest stays. So gaps stay where they were, to a new
// frame. Nothing is filtered: detail faster than half the new rate shows as slower motion, as it does in any
// sampling.
#pragma once

#include "host/keys/KeyTrack.h"

struct ResamplingRule {
  Interpolation interpolation = Interpolation::Linear;
  int64 formerPeriod = 1, period = 1;  // ticks; whole frames lie at their multiples
  bool keepGaps = true;                // else all keys of a curve are one run
};

// Cost: linear in keys and new frames. Runs bridge nothing, keys that stood alone stay selected.
KeyTrack resampled(KeyTrack const& track, ResamplingRule const& rule);
