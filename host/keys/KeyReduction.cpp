#include "host/keys/KeyReduction.h"

#include <algorithm>
#include <cmath>

#include "host/keys/KeyInterpolation.h"
#include "host/time/Ticks.h"

namespace {

// A span of more frames than these that have no key is not looked through; it may not change.
constexpr int64 kMostFrames = 1'000'000;

// The keys of a track as one curve, or those of one component that hold it.
class Curve {
 public:
  Curve(KeyTrack const& track, int component, ReductionRule const& rule)
      : m_shape(component < 0 ? track.shape() : KeyTrack::Shape::Scalar), m_rule(rule) {
    bool const rotation = m_shape == KeyTrack::Shape::Rotation;
    double const limit = rotation ? std::sin(std::min(rule.tolerance, M_PI) / 2) : rule.tolerance;
    m_limit = limit * limit;
    // Two lines are farthest apart where one of them bends, which is at a key; steps change there only.
    m_keysSuffice = rule.interpolation == Interpolation::Constant ||
                    (rule.interpolation == Interpolation::Linear && !rotation && !rule.isWhole);
    read(track, component);
  }

  // Visits the track's indices of the keys that can go.
  template <class Visit>
  void reduce(Visit visit) const {
    int64 beforePrevious = -1, previous = -1, limit = 0;
    for (int64 anchor = 0; anchor + 1 < size();) {
      for (limit = std::max(limit, anchor + 1); !m_stays[at(limit)]; ++limit) {
      }
      int64 const next = farthest({beforePrevious, previous, anchor}, limit);
      for (int64 i = anchor + 1; i < next; ++i) visit(m_index[at(i)]);
      beforePrevious = previous;
      previous = anchor;
      anchor = next;
    }
  }

 private:
  // A key, or none.
  struct Point {
    Curve const* curve = nullptr;
    int64 i = -1;

    explicit operator bool() const { return i >= 0; }
    int64 time() const { return curve->m_times[at(i)]; }
    double value(int c) const { return curve->m_values[at(i * curve->width() + c)]; }
  };

  // The last keys that stay, up to the one from which the search goes on.
  struct Kept {
    int64 beforePrevious, previous, anchor;
  };

  static size_t at(int64 i) { return static_cast<size_t>(i); }
  int64 size() const { return static_cast<int64>(m_times.size()); }
  int width() const { return static_cast<int>(m_shape); }
  Point point(int64 i) const { return {this, i < size() ? i : -1}; }

  int64 firstFrameAfter(int64 time) const {
    return (frameAtOrBefore(time, m_rule.framePeriod) + 1) * m_rule.framePeriod;
  }

  void read(KeyTrack const& track, int component) {
    size_t const count = at(track.count());
    m_times.reserve(count);
    m_values.reserve(count * at(width()));
    int64 index = 0;
    std::vector<unsigned char> bridged;
    unsigned const parts = component < 0 ? KeyTrack::kAll : 1u << component;
    track.forEach(0, track.count(), [&](KeyTrack::Key const& key) {
      int64 const own = index++;
      if (component >= 0 && !(key.components >> component & 1)) return;
      m_index.push_back(own);
      m_times.push_back(key.time);
      bridged.push_back((key.bridges & parts) == parts);
      m_stays.push_back(m_rule.mayGo && !m_rule.mayGo(key));
      for (int c = 0; c < width(); ++c) m_values.push_back(key.values[at(component < 0 ? c : component)]);
    });
    if (m_times.empty()) return;
    m_stays.front() = m_stays.back() = true;
    m_hasFrames.resize(m_times.size());
    for (int64 i = 0; i + 1 < size(); ++i) {
      m_hasFrames[at(i)] = firstFrameAfter(m_times[at(i)]) < m_times[at(i + 1)];
      if (m_rule.hasGaps && m_hasFrames[at(i)] && !bridged[at(i)]) m_stays[at(i)] = m_stays[at(i + 1)] = true;
    }
  }

  // The farthest key found, up to `limit`, for which all keys between it and the anchor can go.
  int64 farthest(Kept const& kept, int64 limit) const {
    int64 good = kept.anchor + 1, bad = limit + 1;
    for (int64 reach = 2; good < limit; reach *= 2) {
      int64 const next = std::min(kept.anchor + reach, limit);
      if (!mayJoin(kept, next)) {
        bad = next;
        break;
      }
      good = next;
    }
    while (bad - good > 1) {
      int64 const middle = good + (bad - good) / 2;
      (mayJoin(kept, middle) ? good : bad) = middle;
    }
    return good;
  }

  // Whether the curve holds when all keys between the anchor and `next` go and all later ones stay for now.
  bool mayJoin(Kept const& kept, int64 next) const {
    auto const [beforePrevious, previous, anchor] = kept;
    if (!spanHolds(point(previous), anchor, next, point(next + 1))) return false;
    if (m_rule.interpolation != Interpolation::Cubic) return true;
    return (previous < 0 || spanHolds(point(beforePrevious), previous, anchor, point(next))) &&
           (next + 1 >= size() || spanHolds(point(anchor), next, next + 1, point(next + 2)));
  }

  // Whether one span from `first` to `last` holds in place of the spans between them.
  bool spanHolds(Point before, int64 first, int64 last, Point after) const {
    Point const a = point(first), b = point(last);
    auto const keyHolds = [&](int64 i) {
      return isNear(between(before, a, b, after, m_times[at(i)]), valuesAt(point(i)));
    };
    // What does not hold mostly deviates most in the middle.
    int64 const middle = first + (last - first) / 2;
    if (middle > first && !keyHolds(middle)) return false;
    for (int64 i = first; i < last; ++i)
      if ((i > first && !keyHolds(i)) || (m_hasFrames[at(i)] && !framesHold(before, a, b, after, i)))
        return false;
    return true;
  }

  // The same at the frames between the original keys i and i + 1.
  bool framesHold(Point before, Point a, Point b, Point after, int64 i) const {
    if (m_keysSuffice) return true;
    int64 const end = m_times[at(i + 1)];
    int64 frame = firstFrameAfter(m_times[at(i)]);
    if ((end - frame) / m_rule.framePeriod > kMostFrames) return false;
    for (; frame < end; frame += m_rule.framePeriod)
      if (!isNear(between(before, a, b, after, frame),
                  between(point(i - 1), point(i), point(i + 1), point(i + 2), frame)))
        return false;
    return true;
  }

  KeyTrack::Values valuesAt(Point key) const {
    KeyTrack::Values values{};
    for (int c = 0; c < width(); ++c) values[at(c)] = key.value(c);
    return values;
  }

  KeyTrack::Values between(Point before, Point a, Point b, Point after, int64 time) const {
    if (m_rule.interpolation == Interpolation::Constant) return valuesAt(a);
    KeyTrack::Values values{};
    interpolateKeys(
        m_shape, m_rule.interpolation, time, before, a, b, after, [](int) { return true; }, values);
    return values;
  }

  // A value that is no number, as extreme ones can make, is near nothing.
  bool isNear(KeyTrack::Values const& a, KeyTrack::Values const& b) const {
    double distance = 0;
    if (m_shape == KeyTrack::Shape::Rotation) {
      interpolation::Quat const turn =
          ~interpolation::Quat(a[3], a[0], a[1], a[2]) * interpolation::Quat(b[3], b[0], b[1], b[2]);
      distance = turn.v.length2();  // the square of the sine of half the angle
    } else {
      for (int c = 0; c < width(); ++c) {
        double const d = m_rule.isWhole ? std::round(a[at(c)]) - std::round(b[at(c)]) : a[at(c)] - b[at(c)];
        distance += d * d;
      }
    }
    return distance <= m_limit;
  }

  KeyTrack::Shape m_shape;
  ReductionRule const& m_rule;
  double m_limit;  // of the squared distance
  bool m_keysSuffice;
  std::vector<int64> m_index, m_times;
  std::vector<double> m_values;            // width() a key
  std::vector<unsigned char> m_stays;      // whatever the curve
  std::vector<unsigned char> m_hasFrames;  // between this key and the next
};

bool isWhole(KeyTrack const& track) {
  return track.countHolding(1) == track.count() && track.countHolding(2) == track.count() &&
         track.countHolding(4) == track.count();
}

}  // namespace

std::vector<unsigned char> redundantKeys(KeyTrack const& track, ReductionRule const& rule) {
  std::vector<unsigned char> lost(static_cast<size_t>(track.count()));
  if (track.shape() != KeyTrack::Shape::Vector || isWhole(track)) {
    Curve(track, -1, rule).reduce([&](int64 i) { lost[static_cast<size_t>(i)] = KeyTrack::kAll; });
    return lost;
  }
  // So that the components together stay within the distance.
  ReductionRule each = rule;
  each.tolerance /= std::sqrt(3.0);
  for (int c = 0; c < 3; ++c)
    Curve(track, c, each).reduce([&](int64 i) {
      lost[static_cast<size_t>(i)] = static_cast<unsigned char>(lost[static_cast<size_t>(i)] | 1u << c);
    });
  return lost;
}

double valueRange(KeyTrack const& track) {
  double range = 0;
  for (int c = 0; c < track.width(); ++c) {
    double least = HUGE_VAL, most = -HUGE_VAL;
    track.forEach(0, track.count(), [&](KeyTrack::Key const& key) {
      if (track.shape() == KeyTrack::Shape::Vector && !(key.components >> c & 1)) return;
      least = std::min(least, key.values[static_cast<size_t>(c)]);
      most = std::max(most, key.values[static_cast<size_t>(c)]);
    });
    range = std::max(range, most - least);
  }
  return range;
}
