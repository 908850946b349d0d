// Thinning a curve: which keys can go while the curve keeps its shape.
//
// Method. From a key that stays, the farthest key is sought up to which everything between can go; the search
// doubles its reach until that fails and then halves. Each attempt compares the new curve with the original
// one at every key and every whole frame of the spans that it changes: the one span that loses keys and, for
// "Cubic", whose slopes look at the neighbours, also the spans before and after it. So the new curve
// is never farther from the original one than the tolerance at any key or frame, however many keys go.
//
// Cost. An attempt that spans m keys costs m, a span that results of m keys costs O(m log m), whatever the
// curve: O(n log n) in keys and frames altogether. A curve that can lose nothing costs O(n).
#pragma once

#include <functional>
#include <vector>

#include "host/keys/KeyTrack.h"

// How far a reduced curve may be from the original one.
struct ReductionTolerances {
  double length;   // millimetres
  double angle;    // radians
  double ofRange;  // other channels: the part of their greatest less their least value

  // Those of the profile (ProfileValues.h).
  static ReductionTolerances fromProfile();
};

struct ReductionRule {
  Interpolation interpolation = Interpolation::Linear;
  double tolerance = 0;   // as values are; rotations: radians between orientations; vectors: distance
  int64 framePeriod = 1;  // ticks; whole frames lie at its multiples
  bool isWhole = false;   // values are rounded where they are read
  // Which keys may go; absent: any. Keys at either end of the curve or of a gap stay all the same.
  std::function<bool(KeyTrack::Key const&)> mayGo = {};
  // Whether frames without a key and a bridge are gaps, as where keys are measurements; else the curve is all
  // there is.
  bool hasGaps = true;
};

// The components that each key can lose, by index; 0: it stays. A gap is a run of whole frames without a key
// over which no bridge passes. Keys of a track that holds keys of single components lose these one by one,
// each with its own gaps. KeyTrack::thin takes them out.
std::vector<unsigned char> redundantKeys(KeyTrack const& track, ReductionRule const& rule);

// The greatest less the least value, of the component where that is most; 0 without keys.
double valueRange(KeyTrack const& track);
