#include "host/keys/KeyResampling.h"

#include <algorithm>
#include <vector>

#include "host/keys/SampleTimes.h"
#include "host/time/Ticks.h"

namespace {

class Resampling {
 public:
  Resampling(KeyTrack const& track, ResamplingRule const& rule)
      : m_track(track), m_rule(rule), m_result(track.shape()) {}

  KeyTrack make() {
    bool const whole = m_track.countHolding(KeyTrack::kAll) == m_track.count();
    if (m_track.shape() != KeyTrack::Shape::Vector || (whole && bridgesAlike())) {
      resample(KeyTrack::kAll);
    } else {
      for (unsigned part : {1u, 2u, 4u}) resample(part);
    }
    return std::move(m_result);
  }

 private:
  // Whether each key bridges all components or none.
  bool bridgesAlike() const {
    if (!m_track.bridgesAny()) return true;
    bool alike = true;
    m_track.forEach(0, m_track.count(), [&](KeyTrack::Key const& key) {
      alike = alike && (key.bridges == 0 || key.bridges == key.components);
    });
    return alike;
  }

  void resample(unsigned part) {
    m_part = part;
    m_lastAlone = -kForever;
    KeyTrack::Key first, last;
    bool isOpen = false;
    auto const end = [&] {
      if (!isOpen) return;
      last.time > first.time ? addRun(first.time, last.time) : addAlone(first, first.time);
    };
    m_track.forEach(0, m_track.count(), [&](KeyTrack::Key const& key) {
      if (!(key.components & part)) return;
      if (!isOpen || !goesOn(last, key.time)) {
        end();
        first = key;
        isOpen = true;
      }
      last = key;
    });
    end();
  }

  bool goesOn(KeyTrack::Key const& key, int64 nextTime) const {
    return !m_rule.keepGaps || (key.bridges & m_part) || nextTime - key.time <= m_rule.formerPeriod;
  }

  void addRun(int64 start, int64 end) {
    // Periods are rounded to ticks, so that a frame of both rates may differ by a few.
    int64 const tolerance = std::min(m_rule.period, m_rule.formerPeriod) / 1000;
    int64 const first = frameAtOrAfter(start - tolerance, m_rule.period);
    int64 const last = frameAtOrBefore(end + tolerance, m_rule.period);
    if (first > last) {
      KeyTrack::Key key;
      int64 const middle = start + (end - start) / 2;
      key.components = m_part;
      key.time = std::clamp(nearestFrame(middle), start, end);
      m_track.evaluate(key.time, m_rule.interpolation, {}, key.values);
      return addAlone(key, middle);
    }
    auto const width = static_cast<size_t>(m_track.width());
    for (int64 from = first; from <= last; from += kBlock) {
      int64 const count = std::min(kBlock, last - from + 1);
      m_values.assign(static_cast<size_t>(count) * width, 0);
      m_track.sample(SampleTimes(from * m_rule.period, m_rule.period, count), m_rule.interpolation, {},
                     m_part, m_values.data(), m_track.width());
      put(from * m_rule.period, count);
    }
    m_lastAlone = -kForever;
  }

  // The values of the block at new frames.
  void put(int64 time, int64 count) {
    auto const width = static_cast<size_t>(m_track.width());
    // A key that stood alone may have gone to the first of them already.
    if (m_part == KeyTrack::kAll && (m_result.empty() || m_result.timeAt(m_result.count() - 1) < time))
      return m_result.append(time, m_rule.period, m_values.data(), count);
    for (int64 i = 0; i < count; ++i) {
      KeyTrack::Values values{};
      std::copy_n(m_values.data() + static_cast<size_t>(i) * width, width, values.data());
      m_result.set(time + i * m_rule.period, values, m_part);
    }
  }

  // `time`: where it stood.
  void addAlone(KeyTrack::Key const& key, int64 time) {
    int64 const frame = nearestFrame(time);
    int64 const there = m_result.find(frame);
    if (there >= 0 && (m_result.at(there).components & m_part)) {
      bool const isAlone = frame == nearestFrame(m_lastAlone) && m_lastAlone > -kForever;
      if (!isAlone || std::abs(time - frame) >= std::abs(m_lastAlone - frame)) return;
    }
    m_result.set(frame, key.values, m_part);
    if (key.selected & m_part) {
      int64 const index = m_result.find(frame);
      m_result.setSelected(index, m_result.at(index).selected | (key.selected & m_part));
    }
    m_lastAlone = time;
  }

  // The time of the new frame that is nearest; of two equally near the earlier.
  int64 nearestFrame(int64 time) const {
    int64 const before = frameAtOrBefore(time, m_rule.period) * m_rule.period;
    return time - before <= before + m_rule.period - time ? before : before + m_rule.period;
  }

  static constexpr int64 kBlock = 4096;

  KeyTrack const& m_track;
  ResamplingRule const& m_rule;
  KeyTrack m_result;
  unsigned m_part = KeyTrack::kAll;
  int64 m_lastAlone = -kForever;  // where the key stood that came last; -kForever: a run came after it
  std::vector<double> m_values;
};

}  // namespace

KeyTrack resampled(KeyTrack const& track, ResamplingRule const& rule) {
  if (rule.formerPeriod == rule.period) return track;
  return Resampling(track, rule).make();
}
