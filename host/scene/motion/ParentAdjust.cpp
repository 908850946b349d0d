// Node::parentAdjust: the same motion in the world, relative to another parent.

#include <algorithm>
#include <cmath>
#include <optional>

#include "host/keys/DataRanges.h"
#include "host/scene/Database.h"
#include "host/scene/HTimeManager.h"
#include "host/scene/KeyTimes.h"
#include "host/scene/Marker.h"
#include "host/scene/RawValues.h"
#include "host/scene/SceneScope.h"

namespace {

using Values = Controller::Values;
using Times = KeyTimes;

// How far the motion between keys may stray: millimetres, radians, parts of the scale. Lengths beyond 10 km
// stray by what is left of their digits.
constexpr double kStrayLength = 0.01, kStrayAngle = 0.01 / 57.29577951308232, kStrayScale = 1e-5;
constexpr double kStrayRelative = 1e-9;
// Values that differ by less, relative to their size, are the same.
constexpr double kSame = 1e-10;
// Between two keys all channels are smooth, so that of very many frames some tell about all.
constexpr int64 kProbes = 64;

// Where a track's curve is pinned: at its whole keys (one of some components pins only these), and just
// outside of all.
Times limitsOf(KeyTrack const& track) {
  Times times;
  track.forEach(0, track.count(), [&](KeyTrack::Key const& key) {
    if (key.components == KeyTrack::kAll) times.push_back(key.time);
  });
  mergeTimes(times, {track.timeAt(0) - 1});
  mergeTimes(times, {track.timeAt(track.count() - 1) + 1});
  return times;
}

template <class Keep>
void keepOnly(Times& times, Keep keep) {
  times.erase(std::remove_if(times.begin(), times.end(), [&](int64 time) { return !keep(time); }),
              times.end());
}

int64 frameAtOrBefore(int64 time) {
  const int64 period = HTimeManager::getInstance()->getTicksPerFrame();
  return (time / period - (time % period < 0)) * period;
}

int64 frameAfter(int64 time) {
  return frameAtOrBefore(time) + HTimeManager::getInstance()->getTicksPerFrame();
}

// The frames strictly inside a range, by their number; empty without any.
HTimeRange framesInside(HTimeRange const& range) {
  const int64 period = HTimeManager::getInstance()->getTicksPerFrame();
  return {frameAfter(range.getStart()) / period, frameAtOrBefore(range.getEnd() - 1) / period};
}

// Adjacent times as ranges, those without a whole frame inside left out.
std::vector<HTimeRange> spansBetween(Times const& times) {
  std::vector<HTimeRange> spans;
  for (size_t i = 1; i < times.size(); ++i) {
    const HTimeRange span(times[i - 1], times[i]);
    if (!framesInside(span).isEmpty()) spans.push_back(span);
  }
  return spans;
}

// The spans whose curve new keys change: with cubic interpolation two on each side.
std::vector<HTimeRange> spansAround(KeyTrack const& track, Times const& added) {
  std::vector<HTimeRange> spans;
  int64 next = 0;
  for (const int64 time : added) {
    const int64 key = track.find(time), last = std::min(key + 2, track.count() - 1);
    for (next = std::max(next, key - 2); next < last; ++next) {
      const HTimeRange span(track.timeAt(next), track.timeAt(next + 1));
      if (!framesInside(span).isEmpty()) spans.push_back(span);
    }
  }
  return spans;
}

bool isFinite(Values const& values) {
  return std::all_of(values.begin(), values.end(), [](double value) { return std::isfinite(value); });
}

bool isFinite(Transform const& place) {
  return isFinite(rawValues(place.position)) && isFinite(rawValues(place.rotation)) &&
         isFinite(rawValues(place.scale));
}

// Radians between two rotations, the distance of two vectors.
double distance(Controller const& channel, Values const& a, Values const& b) {
  if (channel.getPropertyType() == DataSource::Vec3Property)
    return (Vec3(a.data()) - Vec3(b.data())).length();
  Vec3 turn;
  (rotationOf(a).inverse() * rotationOf(b)).getAsVector(turn);
  return turn.length();
}

double sizeOf(Values const& values) { return Vec3(values.data()).length(); }

bool same(Controller const& channel, Values const& a, Values const& b) {
  return distance(channel, a, b) <= kSame * (1 + sizeOf(a));
}

enum class Kind { Translation, Rotation, Scale };

Values part(Transform const& place, Kind kind) {
  return kind == Kind::Translation ? rawValues(place.position)
         : kind == Kind::Rotation  ? rawValues(place.rotation)
                                   : rawValues(place.scale);
}

// The stretches of time in which a marker has data in a clip: at its keys, and between two keys of which
// reduction took out those between. Nothing for one that has no track in any clip: it was not measured but
// placed, and has a motion at all times as other nodes do.
std::optional<std::vector<HTimeRange>> dataOf(Marker const& marker, NLEClip const& clip) {
  bool measured = false;
  for (NLEClip const* one = g_db->getHeadClip(); one && !measured; one = one->getNext())
    for (int layer = 0; layer < one->getNumLayers() && !measured; ++layer)
      measured = marker.getTranslationChannel()->findTrack(one, layer) != nullptr;
  if (!measured) return {};
  Times keys;
  mergeKeyTimes(keys, *marker.getTranslationChannel(), clip);
  std::vector<HTimeRange> data;
  KeyTrack const* track = marker.getTranslationChannel()->findDataTrack(&clip);
  for (const int64 key : keys) {
    if (track && track->bridgedAt(key))
      data.back().include(key);
    else
      data.emplace_back(key, key);
  }
  return data;
}

// The motion of one node while it is worked out. Nothing in the scene changes before apply().
class Adjustment {
 public:
  Adjustment(Node& node, Node* target, HTimeRange const& range)
      : m_node(node),
        m_target(target),
        m_range(range),
        m_clip(g_db->getActiveClip()),
        m_back(node.getPreRotation().inverse()) {
    for (Node const* one = &node; one; one = one->getNodeParent()) m_nodes.push_back(one);
    for (Node const* one = target; one; one = one->getNodeParent()) m_nodes.push_back(one);
    std::sort(m_nodes.begin(), m_nodes.end());
    m_nodes.erase(std::unique(m_nodes.begin(), m_nodes.end()), m_nodes.end());
  }

  bool run();

 private:
  struct Result {
    Controller* channel;
    std::optional<Values> byDefault;
    std::optional<KeyTrack> track;
  };

  bool hasEnd(int64 end) const { return end > -kForever && end < kForever; }
  bool isUnbounded() const { return !hasEnd(m_range.getStart()) && !hasEnd(m_range.getEnd()); }

  // What the node's channels must sum up to at a time.
  Transform wanted(int64 time) const {
    const Transform world = m_node.getWorldTransform(time);
    const Transform seen = m_target ? world.relativeTo(m_target->getWorldTransform(time)) : world;
    return {m_back.rotate(seen.position - m_node.getPreTranslation()), m_back * seen.rotation, seen.scale};
  }

  void collectTimes();
  bool hasData(HTimeRange const& span) const;
  bool isScaled() const;
  bool sampleAll();

  void plan(Controller& channel, Kind kind);
  // The value of the active layer that makes the sum right.
  Values solved(Controller const& channel, int64 time, Values const& values) const {
    return m_clip->getNumLayers() == 1 ? values : channel.solveLayer(time, values);
  }
  Values goal(Controller const& channel, Kind kind, int64 time) const;
  double stray(Controller const& channel, Kind kind, int64 time, Values const& value) const;
  template <class Value>
  bool strays(Controller const& channel, Kind kind, HTimeRange const& span, Value value) const;
  template <class Value>
  bool fits(Controller const& channel, Kind kind, std::vector<Values> const& goals, Value value) const;
  Times keysNeeded(Controller const& channel, std::vector<Values> const& goals) const;
  KeyTrack keyed(Controller const& channel, Times const& times, std::vector<Values> const& goals) const;
  void guard(Controller const& channel, Kind kind, KeyTrack& track) const;
  void refine(Controller const& channel, Kind kind, KeyTrack& track) const;
  void apply();

  Node& m_node;
  Node* m_target;
  HTimeRange m_range;
  NLEClip* m_clip;
  TalixRotation m_back;
  std::vector<Node const*> m_nodes;               // the node, its old and its new ancestors
  std::optional<std::vector<HTimeRange>> m_data;  // of a marker
  HTimeRange m_motion;                            // from the first to the last key of all nodes
  Times m_times;                                  // in the range: where the result must be exact
  std::vector<Transform> m_wanted;                // at those times
  std::vector<Result> m_results;
};

// --- times ---

void Adjustment::collectTimes() {
  for (Node const* node : m_nodes)
    for (Controller const* channel : std::initializer_list<Controller const*>{
             node->getTranslationChannel(), node->getRotationChannel(), node->getScaleChannel()})
      mergeKeyTimes(m_times, *channel, *m_clip);
  if (!m_times.empty()) m_motion = HTimeRange(m_times.front(), m_times.back());
  if (auto const* marker = objectAs<Marker>(&m_node)) m_data = dataOf(*marker, *m_clip);

  Times ends;
  for (const int64 end : {m_range.getStart(), m_range.getEnd()})
    if (hasEnd(end)) ends.push_back(end);
  ends.erase(std::unique(ends.begin(), ends.end()), ends.end());
  mergeTimes(m_times, ends);
  keepOnly(m_times, [this](int64 time) { return m_range.contains(time) && hasData(HTimeRange(time, time)); });
}

bool Adjustment::hasData(HTimeRange const& span) const {
  if (!m_data) return true;
  const auto behind =
      std::upper_bound(m_data->begin(), m_data->end(), span.getStart(),
                       [](int64 time, HTimeRange const& data) { return time < data.getStart(); });
  return behind != m_data->begin() && std::prev(behind)->contains(span.getStart()) &&
         std::prev(behind)->contains(span.getEnd());
}

// Whether an ancestor scales.
bool Adjustment::isScaled() const {
  return std::any_of(m_nodes.begin(), m_nodes.end(), [this](Node const* node) {
    return node != &m_node && (!(node->getConstLocalScale() == Vec3(1, 1, 1)) ||
                               (m_clip && node->getScaleChannel()->hasKeysInClip(m_clip)));
  });
}

// --- one channel ---

// What the active layer ought to give: outside the range what it gives now.
Values Adjustment::goal(Controller const& channel, Kind kind, int64 time) const {
  if (m_range.contains(time)) return solved(channel, time, part(wanted(time), kind));
  Values values;
  channel.evaluateLayer(time, values);
  return values;
}

// How far a value is from what it ought to be; above 1 it is too far.
double Adjustment::stray(Controller const& channel, Kind kind, int64 time, Values const& value) const {
  const Values ought = goal(channel, kind, time);
  const double apart = distance(channel, value, ought);
  if (kind == Kind::Rotation) return apart / kStrayAngle;
  if (kind == Kind::Scale) return apart / std::max(kStrayScale, kStrayRelative * sizeOf(ought));
  // A scaled parent makes more of it, or less.
  const Vec3 scale = m_target ? m_target->getWorldTransform(time).scale : Vec3(1, 1, 1);
  const double most = std::max({std::abs(scale.x), std::abs(scale.y), std::abs(scale.z)});
  return apart * most / std::max(kStrayLength, kStrayRelative * most * sizeOf(ought));
}

// Whether a curve is too far off at a whole frame inside a span.
template <class Value>
bool Adjustment::strays(Controller const& channel, Kind kind, HTimeRange const& span, Value value) const {
  if (!hasData(span)) return false;
  const HTimeRange frames = framesInside(span);
  const int64 period = HTimeManager::getInstance()->getTicksPerFrame();
  const int64 step = 1 + (frames.getEnd() - frames.getStart()) / kProbes;
  const double limit = step == 1 ? 1 : 0.9;  // between the probes it may be a little more
  for (int64 frame = frames.getStart(); frame <= frames.getEnd(); frame += step)
    if (stray(channel, kind, frame * period, value(frame * period)) > limit) return true;
  return false;
}

// Whether a curve is right as it is.
template <class Value>
bool Adjustment::fits(Controller const& channel, Kind kind, std::vector<Values> const& goals,
                      Value value) const {
  for (size_t i = 0; i < m_times.size(); ++i)
    if (!same(channel, goals[i], value(m_times[i]))) return false;
  for (HTimeRange const& span : spansBetween(m_times))
    if (strays(channel, kind, span, value)) return false;
  return true;
}

// The times of m_times at which the channel needs keys: those that it has, the ends of the range, and all
// between two of these where the curve through them alone is not right.
Times Adjustment::keysNeeded(Controller const& channel, std::vector<Values> const& goals) const {
  Times own;
  mergeKeyTimes(own, channel, *m_clip);
  for (const int64 end : {m_range.getStart(), m_range.getEnd()})
    if (hasEnd(end)) mergeTimes(own, {end});
  keepOnly(own, [this](int64 time) { return std::binary_search(m_times.begin(), m_times.end(), time); });
  // Keys that are added later change a cubic curve beyond their neighbours.
  const bool local = channel.getInterpolation() != Interpolation::Cubic;
  if (own.empty() || own.size() == m_times.size() || !local) return m_times;

  const KeyTrack track = keyed(channel, own, goals);
  KeyTrack::Cursor cursor;
  Times needed;
  auto next = own.begin();
  for (size_t i = 0; i < m_times.size();) {
    // The times up to and including the next own one.
    size_t end = i;
    bool right = true;
    for (; end < m_times.size() && (next == own.end() || m_times[end] < *next); ++end) {
      if (!right) continue;
      Values value;
      track.evaluate(m_times[end], channel.getInterpolation(), {}, value, &cursor);
      right = same(channel, goals[end], value);
    }
    const auto begin = m_times.begin();
    if (!right)
      needed.insert(needed.end(), begin + static_cast<ptrdiff_t>(i), begin + static_cast<ptrdiff_t>(end));
    if (next != own.end()) needed.push_back(*next++), ++end;
    i = end;
  }
  return needed;
}

// The active track with keys at some of m_times in place of what it has in the range.
KeyTrack Adjustment::keyed(Controller const& channel, Times const& times,
                           std::vector<Values> const& goals) const {
  KeyTrack const* now = channel.findActiveTrack();
  KeyTrack track = now ? *now : KeyTrack(Controller::shapeOf(channel.getPropertyType()));
  track.eraseRange(m_range.getStart(), m_range.getEnd());
  size_t i = 0;
  for (const int64 time : times) {
    while (m_times[i] != time) ++i;
    track.set(time, goals[i]);
  }
  if (now) DataRanges::bridgeAlike(track, *now);
  for (int64 key = now ? now->nextSelected(-1, KeyTrack::kAll) : -1; key >= 0;
       key = now->nextSelected(key, KeyTrack::kAll)) {
    const KeyTrack::Key selected = now->at(key);
    const int64 kept = m_range.contains(selected.time) ? track.find(selected.time) : -1;
    if (kept >= 0) track.setSelected(kept, selected.selected);
  }
  return track;
}

// Keys beside the ends of the range that hold what lies outside, where it would change. An end at which the
// motion of all nodes ends has nothing outside.
void Adjustment::guard(Controller const& channel, Kind kind, KeyTrack& track) const {
  const auto hold = [&](int64 time) {
    Values value;
    track.evaluate(time, channel.getInterpolation(), {}, value);
    if (hasData(HTimeRange(time, time)) && stray(channel, kind, time, value) > 1)
      track.set(time, goal(channel, kind, time));
  };
  const int64 start = m_range.getStart(), end = m_range.getEnd();
  const int64 first = m_motion.getStart(), last = m_motion.getEnd();
  const bool startsAll = !m_motion.isEmpty() && first >= start && frameAtOrBefore(first) <= start;
  const bool endsAll = !m_motion.isEmpty() && last <= end && frameAfter(last) > end;
  if (hasEnd(start) && !startsAll) hold(frameAtOrBefore(start - 1));
  if (hasEnd(end) && !endsAll) hold(frameAfter(end));
}

// Halves the spans in which the curve strays, until none does.
void Adjustment::refine(Controller const& channel, Kind kind, KeyTrack& track) const {
  const int64 period = HTimeManager::getInstance()->getTicksPerFrame();
  KeyTrack::Cursor cursor;
  const auto value = [&](int64 time) {
    Values values;
    track.evaluate(time, channel.getInterpolation(), {}, values, &cursor);
    return values;
  };
  Times times = limitsOf(track);
  mergeTimes(times, m_times);
  for (std::vector<HTimeRange> spans = spansBetween(times); !spans.empty();) {
    Times added;
    for (HTimeRange const& span : spans) {
      if (!strays(channel, kind, span, value)) continue;
      const HTimeRange frames = framesInside(span);
      added.push_back((frames.getStart() + (frames.getEnd() - frames.getStart()) / 2) * period);
    }
    for (const int64 time : added) track.set(time, goal(channel, kind, time));
    if (added.empty()) return;
    // A key changes the curve of a component that only some keys hold further away.
    const bool far = track.countHolding(KeyTrack::kAll) < track.count();
    spans = far ? spansBetween(limitsOf(track)) : spansAround(track, added);
  }
}

void Adjustment::plan(Controller& channel, Kind kind) {
  std::vector<Values> goals;
  goals.reserve(m_times.size());
  for (size_t i = 0; i < m_times.size(); ++i)
    goals.push_back(solved(channel, m_times[i], part(m_wanted[i], kind)));

  const auto now = [&](int64 time) {
    Values values;
    channel.evaluateLayer(time, values);
    return values;
  };
  if (fits(channel, kind, goals, now)) return;
  if (isUnbounded() && !channel.hasKeysInClip(m_clip) &&
      fits(channel, kind, goals, [&](int64) { return goals.front(); })) {
    m_results.push_back({&channel, part(m_wanted.front(), kind), {}});
    return;
  }
  KeyTrack track = keyed(channel, keysNeeded(channel, goals), goals);
  guard(channel, kind, track);
  refine(channel, kind, track);
  m_results.push_back({&channel, {}, std::move(track)});
}

// --- the node ---

bool Adjustment::sampleAll() {
  for (const int64 time : m_times) {
    m_wanted.push_back(wanted(time));
    if (!isFinite(m_wanted.back())) return false;
  }
  return true;
}

void Adjustment::apply() {
  for (Result& result : m_results) {
    if (result.track) {
      result.channel->beginDataEdit(m_range);
      result.channel->setTrack(m_clip, g_db->getActiveLayer(), std::move(*result.track));
    } else {
      result.channel->beginDefaultEdit();
      result.channel->setDefaultValues(*result.byDefault);
    }
    result.channel->endDataEdit();
  }
}

bool Adjustment::run() {
  if (m_clip) collectTimes();
  // Without a key anywhere all times are alike.
  if (!m_clip || (m_motion.isEmpty() && m_times.empty())) m_times = {0};
  // The node has nothing in the range.
  if (m_times.empty()) return true;
  if (!sampleAll()) return false;

  bool kept = true;
  const std::pair<Controller*, Kind> channels[] = {{m_node.getTranslationChannel(), Kind::Translation},
                                                   {m_node.getRotationChannel(), Kind::Rotation},
                                                   {m_node.getScaleChannel(), Kind::Scale}};
  for (auto const& [channel, kind] : channels) {
    if (kind == Kind::Scale && !isScaled()) continue;
    const bool editable = m_clip ? channel->isEditable() : !channel->isLocked() && !m_node.isLocked();
    if (!editable) {
      kept = false;
    } else if (m_clip) {
      plan(*channel, kind);
    } else {
      m_results.push_back({channel, part(m_wanted.front(), kind), {}});
    }
  }
  apply();
  return kept;
}

}  // namespace

bool Node::parentAdjust(Node* target, HTimeRange const& range) {
  if (target == getNodeParent() || range.isEmpty()) return true;
  if (target && (target == this || target->isDescendedFrom(this))) return false;
  const SceneScope scope(*getDatabase());
  return Adjustment(*this, target, range).run();
}
