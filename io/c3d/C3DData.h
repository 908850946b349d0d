// The data section of a C3D file, read into key tracks in one pass.
#pragma once

#include <vector>

#include "io/Take.h"
#include "io/c3d/C3DBytes.h"
#include "io/c3d/C3DLayout.h"

namespace talix {

// Where one point of the file goes: a point of the take with residuals and cameras, or an output's values
// alone.
struct C3DPointTarget {
  TakePoint* point = nullptr;
  ModelOutput* output = nullptr;
  double factor = 1;        // from the file's coordinates
  double residualStep = 1;  // mm for each 1 of the file's residual
};

struct C3DAnalogTarget {
  TakeAnalogChannel* channel = nullptr;  // holds scale and offset
  bool isUnsigned = false;               // integers without sign
};

struct C3DDataCounts {
  int64 seen = 0;        // point-frames with a position; of points only
  int64 notFinite = 0;   // point-frames whose coordinates are no numbers, read as not seen
  int64 atOrigin = 0;    // point-frames seen at exactly 0, 0, 0
  int64 badSamples = 0;  // analog samples that are no numbers, left out
};

// There is one target for each point and channel of the layout. Holds no more memory than the tracks take and
// gives the file's pages back as it goes.
C3DDataCounts readC3DData(FileBytes const& file, C3DProcessor processor, C3DLayout const& layout,
                          std::vector<C3DPointTarget> const& points,
                          std::vector<C3DAnalogTarget> const& analog, double analogRate);

}  // namespace talix
