// Where a C3D file's data lies and how much there is of it. Header, parameters and file size often disagree;
// what fits the size of the file wins, and a note says so.
#pragma once

#include <string>
#include <vector>

#include "io/Take.h"
#include "io/c3d/C3DBytes.h"
#include "io/c3d/C3DParameters.h"

namespace talix {

// The first block of the file.
struct C3DHeader {
  size_t parameterStart = 0;  // offset of the parameter section
  size_t declaredEnd = 0;     // offset of its end as its own header says; 0: it does not
  int64 pointCount = 0;
  int64 analogPerFrame = 0;  // values: channels times samples
  int64 firstFrame = 0;
  int64 lastFrame = 0;
  double scale = 0;
  int64 dataBlock = 0;
  int64 samplesPerFrame = 0;
  double rate = 0;
};

struct C3DLayout {
  bool real = true;  // values are four-byte reals, else two-byte integers
  int64 pointCount = 0;
  int64 channelCount = 0;
  int64 samplesPerFrame = 0;  // of each analog channel
  double scale = 1;           // of integer coordinates and of all residuals; above 0
  double rate = 0;            // frames a second
  int64 firstFrame = 0;
  int64 frameCount = 0;
  size_t dataStart = 0;

  size_t valueBytes() const { return real ? 4 : 2; }
  size_t pointBytes() const { return 4 * valueBytes(); }
  size_t frameBytes() const {
    return static_cast<size_t>(pointCount) * pointBytes() +
           static_cast<size_t>(channelCount * samplesPerFrame) * valueBytes();
  }
};

// Sets the processor of `bytes`. Throws FileError for a file that is no C3D file.
C3DHeader readC3DHeader(C3DBytes& bytes, std::vector<TakeNote>& notes);

// The whole data section lies within the file. Throws FileError when it cannot.
C3DLayout findC3DLayout(C3DBytes const& bytes, C3DHeader const& header, C3DParameterSection const& section,
                        std::vector<TakeNote>& notes);

}  // namespace talix
