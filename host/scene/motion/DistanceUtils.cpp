#include "host/scene/motion/DistanceUtils.h"

#include <algorithm>
#include <array>
#include <cmath>

#include "host/scene/Database.h"
#include "host/scene/HTimeManager.h"
#include "host/scene/SceneReader.h"

namespace {

// The keys that a node's transform has in the active clip, whatever the layer.
class NodeKeys {
 public:
  explicit NodeKeys(Node const* node) {
    NLEClip const* clip = node->getDatabase()->getActiveClip();
    if (!clip) return;
    for (Controller const* channel : std::initializer_list<Controller const*>{
             node->getTranslationChannel(), node->getRotationChannel(), node->getScaleChannel()}) {
      m_range.include(channel->getKeyRangeInClip(clip));
      for (int layer = 0; layer < clip->getNumLayers(); ++layer)
        if (KeyTrack const* track = channel->findTrack(clip, layer)) m_tracks.push_back(track);
    }
  }
  HTimeRange range() const { return m_range; }
  bool at(int64 time) const {
    return std::any_of(m_tracks.begin(), m_tracks.end(),
                       [&](KeyTrack const* track) { return track->find(time) >= 0; });
  }

 private:
  std::vector<KeyTrack const*> m_tracks;
  HTimeRange m_range;
};

// Takes distances in; the mean and the sum of squares about it are kept current, so that no digits are lost
// to large sums.
struct Statistics {
  int64 count = 0;
  double mean = 0, squares = 0, least = 0, greatest = 0;

  void add(double distance, int64 times = 1) {
    if (times <= 0) return;
    least = count ? std::min(least, distance) : distance;
    greatest = count ? std::max(greatest, distance) : distance;
    count += times;
    double const off = distance - mean;
    mean += off * (static_cast<double>(times) / static_cast<double>(count));
    squares += off * (distance - mean) * static_cast<double>(times);
  }
  double deviation() const { return count ? std::sqrt(squares / static_cast<double>(count)) : 0; }
};

// The distances at times that are a whole number of steps from time 0, first to last (steps). Where nothing
// moves one stands for all.
class Walk {
 public:
  Walk(Node const* a, Node const* b, int64 step)
      : m_step(step), m_reader(std::array{a, b}, a->getDatabase()->getActiveClip()) {
    HTimeRange const motion = m_reader.getMotionRange();
    if (motion.isEmpty()) return;
    m_firstMoving = frameAtOrBefore(motion.getStart(), step);
    m_lastMoving = frameAtOrAfter(motion.getEnd(), step);
  }

  // visit(first step, how many, distance).
  template <class Visit>
  void run(int64 first, int64 last, Visit visit) const {
    constexpr int64 kBlock = 4096;
    while (first <= last) {
      bool const moves = first >= m_firstMoving && first < m_lastMoving;
      if (!moves) {
        int64 const end = first < m_firstMoving ? std::min(last, m_firstMoving - 1) : last;
        visit(first, end - first + 1, at(first, 1)[0]);
        first = end + 1;
        continue;
      }
      int64 const count = std::min({kBlock, last - first + 1, m_lastMoving - first});
      std::vector<double> const distances = at(first, count);
      for (int64 i = 0; i < count; ++i) visit(first + i, 1, distances[static_cast<size_t>(i)]);
      first += count;
    }
  }

 private:
  std::vector<double> at(int64 first, int64 count) const {
    std::vector<double> positions(static_cast<size_t>(6 * count)), distances;
    SceneReader::Arrays arrays;
    arrays.positions = positions.data();
    m_reader.readWorld(SampleTimes(first * m_step, m_step, count), arrays);
    for (double const* pair = positions.data(); pair < positions.data() + positions.size(); pair += 6)
      distances.push_back((Vec3(pair) - Vec3(pair + 3)).length());
    return distances;
  }

  int64 m_step;
  SceneReader m_reader;
  int64 m_firstMoving = 0, m_lastMoving = 0;  // nothing moves before the one, nor from the other on
};

Statistics measure(Node const* a, Node const* b, TSimpleArray<HTimeRange> const& ranges, bool mustHaveKeys,
                   int64 step = 0) {
  if (step <= 0) step = a->getDatabase()->getTimeManager()->getTicksPerFrame();
  step = std::min(step, kForever);
  NodeKeys const keysOfA(a), keysOfB(b);
  Walk const walk(a, b, step);
  Statistics found;
  for (HTimeRange range : ranges) {
    if (mustHaveKeys) {
      range.intersect(keysOfA.range());
      range.intersect(keysOfB.range());
    }
    if (range.isEmpty()) continue;
    walk.run(frameAtOrAfter(range.getStart(), step), frameAtOrBefore(range.getEnd(), step),
             [&](int64 first, int64 count, double distance) {
               if (!mustHaveKeys) return found.add(distance, count);
               for (int64 i = first; i < first + count; ++i)
                 if (keysOfA.at(i * step) && keysOfB.at(i * step)) found.add(distance);
             });
  }
  return found;
}

TSimpleArray<HTimeRange> listOf(HTimeRange const& range) {
  TSimpleArray<HTimeRange> ranges;
  ranges.add(range);
  return ranges;
}

}  // namespace

double DistanceUtils::getDistance(Node const* a, Node const* b, int64 const& time) {
  return (a->getWSPos(time) - b->getWSPos(time)).length();
}

double DistanceUtils::getAvgDistance(Node const* a, Node const* b, TSimpleArray<HTimeRange> const& ranges,
                                     bool mustHaveKeys, int64 step) {
  return measure(a, b, ranges, mustHaveKeys, step).mean;
}

double DistanceUtils::getMinDistance(Node const* a, Node const* b, TSimpleArray<HTimeRange> const& ranges,
                                     bool mustHaveKeys, int64 step) {
  return measure(a, b, ranges, mustHaveKeys, step).least;
}

double DistanceUtils::getMaxDistance(Node const* a, Node const* b, TSimpleArray<HTimeRange> const& ranges,
                                     bool mustHaveKeys, int64 step) {
  return measure(a, b, ranges, mustHaveKeys, step).greatest;
}

double DistanceUtils::getDistanceRange(Node const* a, Node const* b, TSimpleArray<HTimeRange> const& ranges,
                                       bool mustHaveKeys, int64 step) {
  Statistics const found = measure(a, b, ranges, mustHaveKeys, step);
  return found.greatest - found.least;
}

double DistanceUtils::getDistanceSD(Node const* a, Node const* b, TSimpleArray<HTimeRange> const& ranges,
                                    bool mustHaveKeys) {
  return measure(a, b, ranges, mustHaveKeys).deviation();
}

// --- over one range ---

double DistanceUtils::getAvgDistance(Node const* a, Node const* b, HTimeRange const& range, bool mustHaveKeys,
                                     int64 step) {
  return getAvgDistance(a, b, listOf(range), mustHaveKeys, step);
}

double DistanceUtils::getMinDistance(Node const* a, Node const* b, HTimeRange const& range, bool mustHaveKeys,
                                     int64 step) {
  return getMinDistance(a, b, listOf(range), mustHaveKeys, step);
}

double DistanceUtils::getMaxDistance(Node const* a, Node const* b, HTimeRange const& range, bool mustHaveKeys,
                                     int64 step) {
  return getMaxDistance(a, b, listOf(range), mustHaveKeys, step);
}

double DistanceUtils::getDistanceRange(Node const* a, Node const* b, HTimeRange const& range,
                                       bool mustHaveKeys, int64 step) {
  return getDistanceRange(a, b, listOf(range), mustHaveKeys, step);
}

double DistanceUtils::getDistanceSD(Node const* a, Node const* b, HTimeRange const& range,
                                    bool mustHaveKeys) {
  return getDistanceSD(a, b, listOf(range), mustHaveKeys);
}
