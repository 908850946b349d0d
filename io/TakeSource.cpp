#include "io/TakeSource.h"

#include <algorithm>

namespace talix {

namespace {

bool isWhole(KeyTrack::Key const& key) { return key.components == KeyTrack::kAll; }

// The whole keys of a track, as they are.
class KeySource final : public SampleSource {
 public:
  explicit KeySource(KeyTrack const& track) : m_track(track) {}

  void read(SampleTimes const& times, double* values, bool* known) override {
    auto const width = static_cast<size_t>(m_track.width());
    int64 next = times.count() > 0 ? m_track.lowerBound(times[0]) : 0;
    KeyTrack::Reader reader(m_track, next);
    KeyTrack::Key key;
    bool hasKey = false;
    for (int64 i = 0; i < times.count(); ++i) {
      for (; (!hasKey || key.time < times[i]) && next < m_track.count(); ++next, hasKey = true)
        key = reader.next();
      known[i] = hasKey && key.time == times[i] && isWhole(key);
      if (known[i]) std::copy_n(key.values.data(), width, values + static_cast<size_t>(i) * width);
    }
  }

  LeftOut leftOut(SampleTimes const& times) const override { return keysLeftOut(m_track, times); }

 private:
  KeyTrack const& m_track;
};

// The curve through the keys of a track, at all times.
class CurveSource final : public SampleSource {
 public:
  explicit CurveSource(KeyTrack const& track) : m_track(track) {}

  void read(SampleTimes const& times, double* values, bool* known) override {
    m_track.sample(times, Interpolation::Linear, {}, KeyTrack::kAll, values, m_track.width());
    std::fill_n(known, times.count(), true);
  }
  LeftOut leftOut(SampleTimes const& times) const override { return keysLeftOut(m_track, times); }

 private:
  KeyTrack const& m_track;
};

// Camera masks, one a frame of the take.
class MaskSource final : public SampleSource {
 public:
  MaskSource(std::vector<unsigned char> const& masks, int64 start) : m_masks(masks), m_start(start) {}

  void read(SampleTimes const& times, double* values, bool* known) override {
    for (int64 i = 0; i < times.count(); ++i) {
      int64 const frame = (times[i] - m_start) / times.period();
      known[i] = frame >= 0 && frame < static_cast<int64>(m_masks.size());
      values[i] = known[i] ? m_masks[static_cast<size_t>(frame)] : 0;
    }
  }

 private:
  std::vector<unsigned char> const& m_masks;
  int64 m_start;
};

SampleSourcePtr keysOf(KeyTrack const& track) { return std::make_unique<KeySource>(track); }
SampleSourcePtr keysOrNone(KeyTrack const& track) { return track.empty() ? nullptr : keysOf(track); }
SampleSourcePtr curveOrNone(KeyTrack const& track) {
  return track.empty() ? nullptr : std::make_unique<CurveSource>(track);
}

}  // namespace

SampleSource::LeftOut keysLeftOut(KeyTrack const& track, SampleTimes const& times) {
  SampleSource::LeftOut left;
  int64 const count = times.count(), period = times.period();
  track.forEach(0, track.count(), [&](KeyTrack::Key const& key) {
    int64 const fromStart = key.time - times[0];
    if (fromStart % period != 0)
      ++left.between;
    else if (fromStart < 0 || fromStart / period >= count)
      ++left.outside;
    else if (!isWhole(key))
      ++left.partial;
  });
  return left;
}

SampleTimes TakeSource::frameTimes() const {
  int64 const period = ticksPerFrameAt(rate);
  return {firstFrame * period, period, frameCount};
}

TakeSource sourceOf(Take const& take) {
  TakeSource source{static_cast<TakeInfo const&>(take), {}, {}, {}, {}};
  int64 const start = take.firstFrame * ticksPerFrameAt(take.rate);
  for (TakePoint const& point : take.points)
    source.points.push_back(
        {point, keysOf(point.positions), keysOrNone(point.residuals),
         point.cameras.empty() ? nullptr : std::make_unique<MaskSource>(point.cameras, start)});
  for (ModelOutput const& output : take.outputs) source.outputs.push_back({output, keysOf(output.values)});
  for (TakeAnalogChannel const& channel : take.analog)
    source.analog.push_back({channel, keysOf(channel.samples)});
  for (TakeJoint const& joint : take.joints)
    source.joints.push_back({joint, curveOrNone(joint.translations), curveOrNone(joint.rotations)});
  return source;
}

int64 SampleBlock::lengthFor(size_t values) {
  constexpr size_t kDoubles = size_t{1} << 19;
  return static_cast<int64>(std::clamp<size_t>(kDoubles / std::max<size_t>(values, 1), 64, 4096));
}

void SampleBlock::read(SampleTimes const& times) {
  if (!m_source) return;
  auto const count = static_cast<size_t>(times.count());
  if (count > m_room) {
    m_values.resize(count * m_width);
    m_known = std::make_unique<bool[]>(count);
    m_room = count;
  }
  m_source->read(times, m_values.data(), m_known.get());
}

}  // namespace talix
