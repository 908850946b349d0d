// A take as writers see it: what is said about it, and its values, which writers pull a block of times at a
// time from wherever they are. So saving holds one block of values, not a second copy of the take.
#pragma once

#include <memory>
#include <string>
#include <vector>

#include "host/keys/SampleTimes.h"
#include "io/Take.h"

namespace talix {

// The values of one quantity: 3 doubles for positions, translations and outputs, 1 for residuals, cameras and
// analog samples, 4 (x y z w) for rotations.
class SampleSource {
 public:
  virtual ~SampleSource() = default;
  // The values at ascending, evenly spaced times, one after the other. known[i] is set to whether there is
  // one at times[i]; where there is none the value means nothing.
  virtual void read(SampleTimes const& times, double* values, bool* known) = 0;

  // Keys that a file with values at these times cannot hold, as far as nobody has told of them already.
  struct LeftOut {
    int64 between = 0;  // at none of the times
    int64 outside = 0;  // before the first or after the last
    int64 partial = 0;  // at one of the times, without a value on every axis

    int64 off() const { return between + outside; }
  };
  virtual LeftOut leftOut(SampleTimes const&) const { return {}; }
};
// Of a track whose keys stand for themselves.
SampleSource::LeftOut keysLeftOut(KeyTrack const& track, SampleTimes const& times);

using SampleSourcePtr = std::unique_ptr<SampleSource>;

struct PointSource : TakePointInfo {
  SampleSourcePtr positions;
  SampleSourcePtr residuals;  // null: none recorded
  SampleSourcePtr cameras;    // masks; null: none recorded
};
struct ModelOutputSource : ModelOutputInfo {
  SampleSourcePtr values;
};
struct AnalogSource : TakeAnalogInfo {
  SampleSourcePtr samples;
};
struct JointSource : TakeJointInfo {
  SampleSourcePtr translations;  // null: the offset, at all times
  SampleSourcePtr rotations;     // null: none
};

struct TakeSource : TakeInfo {
  std::vector<PointSource> points;
  std::vector<ModelOutputSource> outputs;
  std::vector<AnalogSource> analog;
  std::vector<JointSource> joints;  // parents before children, siblings in file order

  // The times of its frames.
  SampleTimes frameTimes() const;
};

// A take that was read or made, which must outlive the result. Points, outputs and samples have values at
// their whole keys only, joints at all times.
TakeSource sourceOf(Take const& take);

// One block of a source's values at a time.
class SampleBlock {
 public:
  // Times that a block should have, so that blocks of `values` doubles a time together take a few megabytes.
  static int64 lengthFor(size_t values);

  SampleBlock(SampleSource* source, int width) : m_source(source), m_width(static_cast<size_t>(width)) {}
  void read(SampleTimes const& times);
  // Of the i-th of these times; null: there is none.
  double const* at(int64 i) const {
    auto const index = static_cast<size_t>(i);
    return m_source && m_known[index] ? m_values.data() + index * m_width : nullptr;
  }

 private:
  SampleSource* m_source;  // null: no values
  size_t m_width;
  std::vector<double> m_values;
  std::unique_ptr<bool[]> m_known;
  size_t m_room = 0;
};

}  // namespace talix
