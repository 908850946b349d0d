// Files and takes that the C3D tests share.
#pragma once

#include <functional>
#include <string>
#include <vector>

#include "io/Take.h"
#include "io/c3d/C3DParameters.h"
#include "tests/io/TakeTesting.h"

namespace talix {

bool hasNote(const std::vector<TakeNote>& notes, TakeNote::Level level, const std::string& part);

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
  void set(const std::string& group, const C3DParameter& parameter);  // adds or replaces
  std::string bytes() const;
};

C3DParameter integers(const std::string& name, const std::vector<double>& values);
C3DParameter reals(const std::string& name, const std::vector<double>& values);
C3DParameter text(const std::string& name, const std::string& value);

// A take of labelled points that are seen at all frames but those that `seen` denies.
Take movingPoints(int points, int64 frames, const std::function<bool(int, int64)>& seen);

}  // namespace talix
