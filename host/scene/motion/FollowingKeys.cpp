#include "host/scene/motion/FollowingKeys.h"

#include <algorithm>

#include "host/scene/KeyTimes.h"
#include "host/scene/SceneReader.h"

namespace {

constexpr double kTolerance = 0.01;  // millimetres

class Following {
 public:
  Following(Node const& follower, Node const& leader, Vec3 const& offset, NLEClip const& clip)
      : m_follower(follower), m_offset(offset), m_clip(clip), m_reader(nodes(follower, leader), &clip) {
    for (Node const* node : nodes(follower, leader))
      for (; node; node = node->getNodeParent())
        for (Controller const* channel : {static_cast<Controller const*>(node->getTranslationChannel()),
                                          static_cast<Controller const*>(node->getRotationChannel()),
                                          static_cast<Controller const*>(node->getScaleChannel())})
          mergeKeyTimes(m_times, *channel, clip);
  }

  KeyTrack keys(HTimeRange const& range) {
    m_times.erase(
        std::remove_if(m_times.begin(), m_times.end(), [&](int64 time) { return !range.contains(time); }),
        m_times.end());
    mergeTimes(m_times, range.getStart() < range.getEnd() ? KeyTimes{range.getStart(), range.getEnd()}
                                                          : KeyTimes{range.getStart()});
    HTimeRange const motion = m_reader.getMotionRange();
    int64 const period = m_clip.getFramePeriod();
    for (size_t i = 0; i < m_times.size(); ++i) {
      KeyTimes span{m_times[i]};
      if (i + 1 < m_times.size() && m_times[i] < motion.getEnd() && m_times[i + 1] > motion.getStart())
        for (int64 frame = (frameAtOrBefore(m_times[i], period) + 1) * period; frame < m_times[i + 1];
             frame += period) {
          span.push_back(frame);
          if (span.size() == kBlock) add(span);
        }
      if (i + 1 < m_times.size()) span.push_back(m_times[i + 1]);
      add(span);
    }
    m_track.bridge(-kForever, kForever);
    return std::move(m_track);
  }

 private:
  // A node at the root has no parent to follow in.
  static std::vector<Node const*> nodes(Node const& follower, Node const& leader) {
    std::vector<Node const*> all{&leader};
    if (Node const* parent = follower.getNodeParent()) all.push_back(parent);
    return all;
  }

  // Keys at the first time, and at those before the last that need one. The last one stays in `times`, alone.
  void add(KeyTimes& times) {
    std::vector<Vec3> const places = placesAt(times);
    std::vector<bool> keyed(times.size());
    keyed.front() = true;
    std::vector<std::pair<size_t, size_t>> spans{{0, times.size() - 1}};
    while (!spans.empty()) {
      auto const [first, last] = spans.back();
      spans.pop_back();
      size_t farthest = 0;
      double most = kTolerance * 0.99;  // a little for rounding
      for (size_t i = first + 1; i < last; ++i) {
        double const part =
            static_cast<double>(times[i] - times[first]) / static_cast<double>(times[last] - times[first]);
        double const off = (places[first] + (places[last] - places[first]) * part - places[i]).length();
        if (off > most) most = off, farthest = i;
      }
      if (farthest == 0) continue;
      keyed[farthest] = true;
      spans.emplace_back(first, farthest);
      spans.emplace_back(farthest, last);
    }
    for (size_t i = 0; i < times.size(); ++i)
      if (keyed[i]) m_track.set(times[i], {places[i].x, places[i].y, places[i].z});
    times = {times.back()};
  }

  // The follower's translations.
  std::vector<Vec3> placesAt(KeyTimes const& times) const {
    std::vector<Transform> const worlds = m_reader.readWorld(SampleTimes(times));
    auto const width = static_cast<size_t>(m_reader.getNumNodes());
    std::vector<Vec3> places(times.size());
    for (size_t i = 0; i < times.size(); ++i) {
      Vec3 place = (worlds[i * width] * Transform{m_offset, {}, {1, 1, 1}}).position;
      if (width > 1) place = positionRelativeTo(worlds[i * width + 1], place);
      places[i] = m_follower.getPreRotation().inverse().rotate(place - m_follower.getPreTranslation());
    }
    return places;
  }

  static constexpr size_t kBlock = 65536;  // frames

  Node const& m_follower;
  Vec3 m_offset;
  NLEClip const& m_clip;
  SceneReader m_reader;
  KeyTimes m_times;
  KeyTrack m_track{KeyTrack::Shape::Vector};
};

}  // namespace

KeyTrack followingKeys(Node const& follower, Node const& leader, Vec3 const& offset, NLEClip& clip,
                       HTimeRange const& range) {
  return Following(follower, leader, offset, clip).keys(range);
}
