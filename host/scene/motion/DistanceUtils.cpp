#include "host/scene/motion/DistanceUtils.h"

#include <algorithm>
#include <cmath>

#include "host/scene/Database.h"
#include "host/scene/HTimeManager.h"

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

// Takes distances in one by one; the mean and the sum of squares about it are kept current, so that no
// digits are lost to large sums.
struct Statistics {
  int64 count = 0;
  double mean = 0, squares = 0, least = 0, greatest = 0;

  void add(double distance) {
    least = count ? std::min(least, distance) : distance;
    greatest = count ? std::max(greatest, distance) : distance;
    const double off = distance - mean;
    mean += off / static_cast<double>(++count);
    squares += off * (distance - mean);
  }
  double deviation() const { return count ? std::sqrt(squares / static_cast<double>(count)) : 0; }
};

Statistics measure(Node const* a, Node const* b, TSimpleArray<HTimeRange> const& ranges, bool mustHaveKeys,
                   int64 step = 0) {
  if (step <= 0) step = a->getDatabase()->getTimeManager()->getTicksPerFrame();
  step = std::min(step, kForever);
  const NodeKeys keysOfA(a), keysOfB(b);
  Statistics found;
  for (HTimeRange range : ranges) {
    if (mustHaveKeys) {
      range.intersect(keysOfA.range());
      range.intersect(keysOfB.range());
    }
    if (range.isEmpty()) continue;
    int64 time = range.getStart() / step * step;
    if (time < range.getStart()) time += step;
    for (; time <= range.getEnd(); time += step)
      if (!mustHaveKeys || (keysOfA.at(time) && keysOfB.at(time)))
        found.add(DistanceUtils::getDistance(a, b, time));
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
  const Statistics found = measure(a, b, ranges, mustHaveKeys, step);
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
