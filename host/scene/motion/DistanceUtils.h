// Distances of two nodes, in millimetres, between their positions in the world.
//
// Statistics measure once a frame: at the times that are a whole number of steps from time 0 and lie in the
// range, or in one of the ranges; where ranges overlap a time counts once for each. mustHaveKeys: only where
// both nodes have a key at that very time, on their translation, rotation or scale, in any layer of the
// active clip.
// Where nothing is measured the result is 0. The standard deviation is that of all that was measured
// (divided by the count).
//
// Times are ticks. The last number is the step; one that is not positive stands for the scene's ticks per
// frame, which the standard deviation always takes. The cost is linear in the frames from the first to the
// last key of the nodes and all above them; frames at which nothing moves cost nothing.
#pragma once

#include "host/scene/Node.h"

class DistanceUtils {
 public:
  static double getDistance(Node const* a, Node const* b, int64 const& time);

  static double getAvgDistance(Node const* a, Node const* b, HTimeRange const& range, bool mustHaveKeys,
                               int64 step);
  static double getAvgDistance(Node const* a, Node const* b, TSimpleArray<HTimeRange> const& ranges,
                               bool mustHaveKeys, int64 step);
  static double getMinDistance(Node const* a, Node const* b, HTimeRange const& range, bool mustHaveKeys,
                               int64 step);
  static double getMinDistance(Node const* a, Node const* b, TSimpleArray<HTimeRange> const& ranges,
                               bool mustHaveKeys, int64 step);
  static double getMaxDistance(Node const* a, Node const* b, HTimeRange const& range, bool mustHaveKeys,
                               int64 step);
  static double getMaxDistance(Node const* a, Node const* b, TSimpleArray<HTimeRange> const& ranges,
                               bool mustHaveKeys, int64 step);
  // The greatest less the least.
  static double getDistanceRange(Node const* a, Node const* b, HTimeRange const& range, bool mustHaveKeys,
                                 int64 step);
  static double getDistanceRange(Node const* a, Node const* b, TSimpleArray<HTimeRange> const& ranges,
                                 bool mustHaveKeys, int64 step);
  static double getDistanceSD(Node const* a, Node const* b, HTimeRange const& range, bool mustHaveKeys);
  static double getDistanceSD(Node const* a, Node const* b, TSimpleArray<HTimeRange> const& ranges,
                              bool mustHaveKeys);
};
