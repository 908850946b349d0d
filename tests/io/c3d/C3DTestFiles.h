// Files and takes that the C3D tests share.
#pragma once

#include <functional>
#include <string>
#include <vector>

#include "io/Take.h"
#include "io/c3d/C3DParameters.h"
#include "tests/io/TakeTesting.h"

namespace talix {

bool hasNote(std::vector<TakeNote> const& notes, TakeNote::Level level, std::string const& part);

// An Intel file with integer coordinates and two points, made by hand. Change what is of interest, then take
// its bytes.
struct SmallC3D {
  int frames = 4;
  int channels = 0;
  int samplesPerFrame = 1;
  int headerFirst = 1, headerLast = 4;
  int headerDataBlock = 0;  // 0: where the data is
  double scale = 0.5;
  C3DParameters parameters;  // POINT and ANALOG are there
  std::string data;  // two-byte integers; frames of points and analog samples, all counting up, by default

  SmallC3D();
  void set(std::string const& group, C3DParameter const& parameter);  // adds or replaces
  std::string bytes() const;
};

C3DParameter integers(std::string const& name, std::vector<double> const& values);
C3DParameter reals(std::string const& name, std::vector<double> const& values);
C3DParameter text(std::string const& name, std::string const& value);

// A take of labelled points that are seen at all frames but those that `seen` denies.
Take movingPoints(int points, int64 frames, std::function<bool(int, int64)> const& seen);

}  // namespace talix
