// The data section of a C3D file: reals as Intel processors store them, whole blocks.
#pragma once

#include <functional>
#include <ostream>
#include <set>

#include "io/TakeSource.h"

namespace talix {

struct C3DDataPlan {
  SampleTimes frames{0, 1, 0};
  SampleTimes samples{0, 1, 0};  // of all frames
  int64 samplesPerFrame = 1;     // of each analog channel
  bool withAnalog = false;
  double unit = 1;          // mm for each unit of the file
  double residualStep = 1;  // mm for each 1 of the file's residual
};

struct C3DDataLosses {
  int64 positions = 0;         // no finite four-byte reals, written as not seen
  int64 samples = 0;           // no finite four-byte reals or without a value, written as 0
  std::set<size_t> camerasOf;  // points that the eighth camera saw, for which C3D has no bit
};

// Points first, then outputs. Calls tell(frame) now and then.
C3DDataLosses writeC3DData(TakeSource const& take, C3DDataPlan const& plan, std::ostream& out,
                           std::function<void(int64 frame)> const& tell);

// The largest step in mm that makes every residual of the take a multiple of it up to 255; when there is
// none, the 255th part of the largest, and `exact` is false. 1 without residuals.
double c3dResidualStep(TakeSource const& take, SampleTimes const& frames, bool& exact);

}  // namespace talix
