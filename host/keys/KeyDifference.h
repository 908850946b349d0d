// What differs between two states of a track.
#pragma once

#include "host/keys/KeyTrack.h"

struct KeyDifference {
  int64 added = 0, removed = 0;
  int64 changed = 0;          // keys at the same time of another value, component, bridge or selection flag
  int64 first = 0, last = 0;  // the times of the first and the last key that differs
  double largest = 0;         // the largest difference of a component that both hold; of rotations the angle
};

// Passes over what the two share: the cost is that of the leaves that differ, and of the way to them.
KeyDifference differenceOf(KeyTrack const& before, KeyTrack const& after);
