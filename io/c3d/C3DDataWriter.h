// The data section of a C3D file: reals as Intel processors store them, whole blocks.
#pragma once

#include <ostream>

#include "io/Take.h"
#include "io/c3d/C3DGrid.h"

namespace talix {

struct C3DDataPlan {
  C3DGrid frames;
  C3DGrid samples;  // of all frames; a whole number per frame
  bool withAnalog = false;
  double unit = 1;          // mm for each unit of the file
  double residualStep = 1;  // mm for each 1 of the file's residual
};

struct C3DDataLosses {
  int64 positions = 0;  // no finite four-byte reals, written as not seen
  int64 samples = 0;    // no finite four-byte reals or without a key, written as 0
};

// Points first, then outputs.
C3DDataLosses writeC3DData(Take const& take, C3DDataPlan const& plan, std::ostream& out);

// The largest step in mm that makes every residual of the take a multiple of it up to 255; when there is
// none, the 255th part of the largest, and `exact` is false. 1 without residuals.
double c3dResidualStep(Take const& take, bool& exact);

}  // namespace talix
