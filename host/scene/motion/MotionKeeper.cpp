#include "host/scene/motion/MotionKeeper.h"

#include <algorithm>
#include <cmath>
#include <optional>

#include "host/keys/DataRanges.h"
#include "host/keys/SampleTimes.h"
#include "host/math/Degrees.h"
#include "host/scene/DataEdit.h"
#include "host/scene/Database.h"
#include "host/scene/Editability.h"
#include "host/scene/HTimeManager.h"
#include "host/scene/RawValues.h"

namespace {

using Values = Controller::Values;

// How far the motion between keys may be off: millimetres, radians, parts of the scale. Beyond 10 km a length
// has no more digits than kRelative leaves.
constexpr double kLengthTolerance = 0.01, kAngleTolerance = 0.01 / kDegreesPerRadian, kScaleTolerance = 1e-5;
constexpr double kRelative = 1e-9;
// Values that differ by less, relative to their size, are the same.
constexpr double kSame = 1e-10;
// The goals at so many frames are worked out once for all channels and rounds. Of more frames some tell about
// all, since between two keys every channel is smooth.
constexpr int64 kMostFrames = 500'000, kProbes = 64;

bool hasEnd(int64 end) { return end > -kForever && end < kForever; }

bool isFinite(Values const& values) {
  return std::all_of(values.begin(), values.end(), [](double value) { return std::isfinite(value); });
}

template <class Keep>
void keepOnly(KeyTimes& times, Keep keep) {
  times.erase(std::remove_if(times.begin(), times.end(), [&](int64 time) { return !keep(time); }),
              times.end());
}

double sizeOf(Values const& values) { return Vec3(values.data()).length(); }

}  // namespace

// --- values ---

struct MotionKeeper::Part {
  Kind kind;

  static constexpr char const* kNames[] = {"Translation", "Rotation", "Scale"};
  char const* name() const { return kNames[kind]; }
  Values of(Transform const& transform) const {
    return kind == kTranslation ? rawValues(transform.position)
           : kind == kRotation  ? rawValues(transform.rotation)
                                : rawValues(transform.scale);
  }
  // Radians between two rotations, the distance of two vectors.
  double distance(Values const& a, Values const& b) const {
    if (kind != kRotation) return (Vec3(a.data()) - Vec3(b.data())).length();
    Vec3 turn;
    (rotationOf(a).inverse() * rotationOf(b)).getAsVector(turn);
    return turn.length();
  }
  bool same(Values const& a, Values const& b) const { return distance(a, b) <= kSame * (1 + sizeOf(a)); }
  // Above 1 a value is too far from what it ought to be. `reach`: how much the parent's scale makes of a
  // length.
  double deviation(Values const& value, Values const& ought, double reach) const {
    double const apart = distance(value, ought);
    if (kind == kRotation) return apart / kAngleTolerance;
    if (kind == kScale) return apart / std::max(kScaleTolerance, kRelative * sizeOf(ought));
    return apart * reach / std::max(kLengthTolerance, kRelative * reach * sizeOf(ought));
  }
};

// What the node's channels must sum up to at times, and what the target's scale makes of lengths there.
struct MotionKeeper::Goals {
  KeyTimes times;
  std::vector<Transform> sums;
  std::vector<double> reach;
};

// --- one clip ---

class MotionKeeper::ClipMotion {
 public:
  ClipMotion(MotionKeeper& keeper, NLEClip* clip, MotionScope::Relation const& relation);

  // Keys one layer of a channel anew.
  void rekey(Part part);
  int layer() const { return m_layer; }

 private:
  bool contains(int64 time) const { return m_keeper.m_range.contains(time); }
  bool hasData(int64 time) const { return !m_measured || (m_data && m_data->hasDataAt(time)); }
  int64 frameStart(int64 time) const { return frameAtOrBefore(time, m_period) * m_period; }
  int64 nextFrameStart(int64 time) const { return frameStart(time) + m_period; }

  void collectTimes(MotionScope::Relation const& relation);
  Goals goalsAt(KeyTimes times) const;
  Goals const& goalsAtFrames() const;

  // The layer's own part of the goals of a channel, inside the range; outside it is what the layer gives now.
  std::vector<Values> valuesAt(Part part, Goals const& goals) const;
  std::vector<Values> sampled(Part part, KeyTrack const* track, KeyTimes const& times) const;
  std::vector<HTimeRange> spansOf(KeyTimes const& limits) const;
  std::vector<bool> deviating(Part part, KeyTrack const* track, std::vector<HTimeRange> const& spans) const;
  KeyTimes keysNeeded(Part part, std::vector<Values> const& values) const;
  void holdOutside(Part part, KeyTrack& track) const;
  void refine(Part part, KeyTrack& track) const;

  Controller& channel(Part part) const { return *m_keeper.m_channels[static_cast<size_t>(part.kind)]; }
  KeyTrack const* present(Part part) const { return channel(part).findTrack(m_clip, m_layer); }

  MotionKeeper& m_keeper;
  NLEClip* m_clip;
  int m_layer;
  int64 m_period;
  SceneReader m_node;                   // as it moved
  std::optional<SceneReader> m_target;  // as it is now
  KeyTrack m_positions;                 // of a marker: those that tell where it was seen
  bool m_measured = false;
  std::optional<DataRanges> m_data;
  HTimeRange m_motion;     // from the first to the last key of all that moves
  Goals m_goals;           // at the times at which the result must be exact
  mutable Goals m_frames;  // at the whole frames between them; empty: not asked for, or too many
};

MotionKeeper::ClipMotion::ClipMotion(MotionKeeper& keeper, NLEClip* clip,
                                     MotionScope::Relation const& relation)
    : m_keeper(keeper),
      m_clip(clip),
      m_layer(keeper.layerToWrite(clip)),
      m_period(keeper.m_scene.getTimeManager()->getTicksPerFrame()),
      m_node({&keeper.m_known, 1}, clip, [&keeper](Node const* node) { return keeper.m_scope.former(node); }),
      m_positions(KeyTrack::Shape::Vector) {
  Node const* target = keeper.m_target;
  if (target) m_target.emplace(std::span(&target, 1), clip);
  if (keeper.m_node.isKindOf(&Marker::s_classMarker)) {
    // One that has no track anywhere was not measured but placed, and has a motion at all times as other
    // nodes do.
    ChannelState const& translation = keeper.m_before.translation;
    m_measured = !translation.layers.empty();
    for (int layer = clip->getNumLayers(); layer-- > 0;)
      if (KeyTrack const* track = translation.find(clip, layer); track && !track->empty())
        m_positions = *track;
    m_data.emplace(m_positions, m_period);
  }
  collectTimes(relation);
}

void MotionKeeper::ClipMotion::collectTimes(MotionScope::Relation const& relation) {
  KeyTimes times = relation.times;
  for (ChannelState const* state : m_keeper.m_before.channels()) mergeKeyTimes(times, *state, m_clip);
  for (Controller const* channel : m_keeper.m_channels) mergeKeyTimes(times, *channel, *m_clip);
  if (!times.empty()) m_motion = HTimeRange(times.front(), times.back());
  for (int64 const end : {m_keeper.m_range.getStart(), m_keeper.m_range.getEnd()})
    if (hasEnd(end)) mergeTimes(times, {end});
  // What is keyed nowhere is told apart from the default value by one key.
  if (times.empty()) times.push_back(m_keeper.m_scene.getTimeManager()->getAnimRange().getStart());
  keepOnly(times, [this](int64 time) { return contains(time) && hasData(time); });
  m_goals = goalsAt(std::move(times));
}

MotionKeeper::Goals const& MotionKeeper::ClipMotion::goalsAtFrames() const {
  int64 const first = nextFrameStart(m_goals.times.front()), last = frameStart(m_goals.times.back());
  if (m_frames.times.empty() && first <= last && (last - first) / m_period < kMostFrames) {
    KeyTimes frames;
    for (int64 time = first; time <= last; time += m_period) frames.push_back(time);
    m_frames = goalsAt(std::move(frames));
  }
  return m_frames;
}

MotionKeeper::Goals MotionKeeper::ClipMotion::goalsAt(KeyTimes times) const {
  // Rounds that ask for some of the known frames get them from there.
  bool const known = !m_frames.times.empty() && std::all_of(times.begin(), times.end(), [this](int64 time) {
    return time % m_period == 0 && time >= m_frames.times.front() && time <= m_frames.times.back();
  });
  if (known) {
    Goals goals{std::move(times), {}, {}};
    for (int64 const time : goals.times) {
      auto const i = static_cast<size_t>((time - m_frames.times.front()) / m_period);
      goals.sums.push_back(m_frames.sums[i]);
      goals.reach.push_back(m_frames.reach[i]);
    }
    return goals;
  }
  Goals goals{std::move(times), {}, {}};
  goals.sums = m_node.readWorld(SampleTimes(goals.times));
  goals.reach.assign(goals.times.size(), 1);
  if (m_target) {
    std::vector<Transform> const spaces = m_target->readWorld(SampleTimes(goals.times));
    for (size_t i = 0; i < spaces.size(); ++i) {
      Vec3 const& scale = spaces[i].scale;
      goals.sums[i] = goals.sums[i].relativeTo(spaces[i]);
      goals.reach[i] = std::max({std::abs(scale.x), std::abs(scale.y), std::abs(scale.z)});
    }
  }
  for (Transform& sum : goals.sums) {
    sum = {m_keeper.m_back.rotate(sum.position - m_keeper.m_origin), m_keeper.m_back * sum.rotation,
           sum.scale};
    for (Kind const kind : {kTranslation, kRotation, kScale})
      m_keeper.m_finite = m_keeper.m_finite && isFinite(Part{kind}.of(sum));
  }
  return goals;
}

// --- layers ---

std::vector<Values> MotionKeeper::ClipMotion::sampled(Part part, KeyTrack const* track,
                                                      KeyTimes const& times) const {
  Values const otherwise =
      m_layer == 0 ? m_keeper.m_defaults[static_cast<size_t>(part.kind)] : channel(part).neutral();
  return LayeredKeys{
      channel(part).getPropertyType(), channel(part).getInterpolation(), otherwise, {&track, 1}}
      .sample(SampleTimes(times));
}

std::vector<Values> MotionKeeper::ClipMotion::valuesAt(Part part, Goals const& goals) const {
  std::vector<Values> values;
  values.reserve(goals.times.size());
  for (Transform const& sum : goals.sums) values.push_back(part.of(sum));
  if (m_clip->getNumLayers() > 1) {
    // All layers make the sum: what those below and above leave is this one's part.
    Controller const& own = channel(part);
    Values const neutral = own.neutral();
    std::vector<KeyTrack const*> below, above{nullptr};
    for (int layer = 0; layer < m_clip->getNumLayers(); ++layer)
      if (layer != m_layer) (layer < m_layer ? below : above).push_back(own.findTrack(m_clip, layer));
    auto const sum = [&](Values const& otherwise, std::vector<KeyTrack const*> const& layers) {
      return LayeredKeys{own.getPropertyType(), own.getInterpolation(), otherwise, layers}.sample(
          SampleTimes(goals.times));
    };
    auto const lower =
        sum(m_layer == 0 ? neutral : m_keeper.m_defaults[static_cast<size_t>(part.kind)], below);
    auto const upper = sum(neutral, above);
    for (size_t i = 0; i < values.size(); ++i) {
      if (part.kind == kRotation)
        values[i] = rawValues(rotationOf(lower[i]).inverse() * rotationOf(values[i]) *
                              rotationOf(upper[i]).inverse());
      else
        for (size_t k = 0; k < 3; ++k) values[i][k] -= lower[i][k] + upper[i][k];
    }
  }
  if (!m_keeper.isEverywhere()) {
    std::vector<Values> const now = sampled(part, present(part), goals.times);
    for (size_t i = 0; i < values.size(); ++i)
      if (!contains(goals.times[i])) values[i] = now[i];
  }
  return values;
}

// --- spans between keys ---

// Adjacent times as ranges, those without a whole frame inside left out.
std::vector<HTimeRange> MotionKeeper::ClipMotion::spansOf(KeyTimes const& limits) const {
  std::vector<HTimeRange> spans;
  for (size_t i = 1; i < limits.size(); ++i)
    if (nextFrameStart(limits[i - 1]) < limits[i]) spans.emplace_back(limits[i - 1], limits[i]);
  return spans;
}

// In which spans a curve is too far off at a frame that has data.
std::vector<bool> MotionKeeper::ClipMotion::deviating(Part part, KeyTrack const* track,
                                                      std::vector<HTimeRange> const& spans) const {
  if (spans.empty()) return {};
  bool const all = !goalsAtFrames().times.empty();
  KeyTimes times;
  std::vector<std::pair<size_t, double>> probes;  // span, and how much of the tolerance counts
  for (size_t i = 0; i < spans.size(); ++i) {
    int64 const first = nextFrameStart(spans[i].getStart()), last = frameStart(spans[i].getEnd() - 1);
    int64 const step = all ? 1 : 1 + (last - first) / m_period / kProbes;
    // Between the probes it may be a little more.
    for (int64 time = first; time <= last; time += step * m_period)
      if (hasData(time)) times.push_back(time), probes.emplace_back(i, step == 1 ? 1 : 0.9);
  }
  std::vector<bool> deviates(spans.size());
  if (times.empty()) return deviates;
  std::vector<Values> const is = sampled(part, track, times);
  Goals const goals = goalsAt(std::move(times));
  std::vector<Values> const ought = valuesAt(part, goals);
  for (size_t i = 0; i < probes.size(); ++i)
    if (part.deviation(is[i], ought[i], goals.reach[i]) > probes[i].second) deviates[probes[i].first] = true;
  return deviates;
}

// The times at which the channel needs keys: those that it has, the ends of the range, and all between two of
// these where the curve through them alone is not right.
KeyTimes MotionKeeper::ClipMotion::keysNeeded(Part part, std::vector<Values> const& values) const {
  KeyTimes const& times = m_goals.times;
  KeyTimes own;
  mergeKeyTimes(own, channel(part), *m_clip);
  for (int64 const end : {m_keeper.m_range.getStart(), m_keeper.m_range.getEnd()})
    if (hasEnd(end)) mergeTimes(own, {end});
  keepOnly(own, [&](int64 time) { return std::binary_search(times.begin(), times.end(), time); });
  // Keys that are added later change a cubic curve beyond their neighbours.
  bool const local = channel(part).getInterpolation() != Interpolation::Cubic;
  if (own.empty() || own.size() == times.size() || !local) return times;

  KeyTrack track =
      present(part) ? *present(part) : KeyTrack(Controller::shapeOf(channel(part).getPropertyType()));
  for (size_t i = 0, k = 0; k < own.size(); ++i)
    if (times[i] == own[k]) track.set(times[i], values[i]), ++k;
  std::vector<Values> const is = sampled(part, &track, times);
  KeyTimes needed;
  for (size_t i = 0, k = 0; i < times.size(); ++k) {
    // Up to and with the next own one.
    size_t const first = i;
    bool right = true;
    for (; i < times.size() && (k == own.size() || times[i] < own[k]); ++i)
      right &= part.same(values[i], is[i]);
    if (!right)
      needed.insert(needed.end(), times.begin() + static_cast<ptrdiff_t>(first),
                    times.begin() + static_cast<ptrdiff_t>(i));
    if (k < own.size()) needed.push_back(times[i++]);
  }
  return needed;
}

// Keys beside the ends of the range that hold what lies outside, where it would change. An end at which the
// motion of all nodes ends has nothing outside.
void MotionKeeper::ClipMotion::holdOutside(Part part, KeyTrack& track) const {
  int64 const start = m_keeper.m_range.getStart(), end = m_keeper.m_range.getEnd();
  int64 const first = m_motion.getStart(), last = m_motion.getEnd();
  bool const startsAll = !m_motion.isEmpty() && first >= start && frameStart(first) <= start;
  bool const endsAll = !m_motion.isEmpty() && last <= end && nextFrameStart(last) > end;
  KeyTimes beside;
  if (hasEnd(start) && !startsAll) beside.push_back(frameStart(start - 1));
  if (hasEnd(end) && !endsAll) beside.push_back(nextFrameStart(end));
  // Where a marker was not seen there, what lies outside begins at its next key.
  for (int64& time : beside) {
    if (hasData(time)) continue;
    int64 const key = time < start ? m_positions.lowerBound(time) - 1 : m_positions.lowerBound(time);
    time = key < 0 || key >= m_positions.count() ? kForever : m_positions.timeAt(key);
  }
  keepOnly(beside, hasEnd);
  std::vector<Values> const ought = sampled(part, present(part), beside), is = sampled(part, &track, beside);
  for (size_t i = 0; i < beside.size(); ++i)
    if (part.deviation(is[i], ought[i], 1) > 1) track.set(beside[i], ought[i]);
}

// Halves the spans in which the curve deviates, until none does.
void MotionKeeper::ClipMotion::refine(Part part, KeyTrack& track) const {
  KeyTimes limits = keyTimesOf(track);
  mergeTimes(limits, m_goals.times);
  for (std::vector<HTimeRange> spans = spansOf(limits); !spans.empty();) {
    std::vector<bool> const deviates = deviating(part, &track, spans);
    KeyTimes added;
    for (size_t i = 0; i < spans.size(); ++i) {
      if (!deviates[i]) continue;
      int64 const first = nextFrameStart(spans[i].getStart()), last = frameStart(spans[i].getEnd() - 1);
      added.push_back(first + (last - first) / m_period / 2 * m_period);
    }
    if (added.empty()) return;
    Goals const goals = goalsAt(added);
    std::vector<Values> const values = valuesAt(part, goals);
    for (size_t i = 0; i < added.size(); ++i) track.set(added[i], values[i]);
    // A key changes the curve up to two keys away (cubic), or further where keys hold single components.
    bool const far = track.countHolding(KeyTrack::kAll) < track.count();
    KeyTimes near = keyTimesOf(track);
    spans = spansOf(near);
    if (far) continue;
    std::erase_if(spans, [&](HTimeRange const& span) {
      int64 const from = track.find(span.getStart()), to = track.count() - 1;
      auto const next =
          std::lower_bound(added.begin(), added.end(), track.timeAt(std::max<int64>(from - 2, 0)));
      return next == added.end() || *next > track.timeAt(std::min(from + 3, to));
    });
  }
}

void MotionKeeper::ClipMotion::rekey(Part part) {
  if (m_goals.times.empty()) return;  // the node has nothing in the range
  std::vector<Values> const values = valuesAt(part, m_goals);
  std::vector<Values> const is = sampled(part, present(part), m_goals.times);
  bool right = true;
  for (size_t i = 0; i < values.size() && right; ++i) right = part.same(values[i], is[i]);
  if (right) {
    std::vector<bool> const deviates = deviating(part, present(part), spansOf(m_goals.times));
    if (std::find(deviates.begin(), deviates.end(), true) == deviates.end()) return;
  }
  if (Obstacle const obstacle = obstacleToKeys(channel(part), m_clip, m_layer); obstacle != Obstacle::none)
    return m_keeper.cannotKeep(part, m_clip, reasonOf(obstacle));

  KeyTrack track =
      present(part) ? *present(part) : KeyTrack(Controller::shapeOf(channel(part).getPropertyType()));
  size_t i = 0;
  for (int64 const time : keysNeeded(part, values)) {
    while (m_goals.times[i] != time) ++i;
    track.set(time, values[i]);
  }
  holdOutside(part, track);
  // What holds the outside may bend the curve inside, where the range ends without data.
  std::vector<Values> const bent = sampled(part, &track, m_goals.times);
  for (size_t k = 0; k < values.size(); ++k)
    if (!part.same(values[k], bent[k])) track.set(m_goals.times[k], values[k]);
  refine(part, track);
  m_keeper.m_changes.push_back({&channel(part), m_clip, m_layer, std::move(track)});
}

// --- the node ---

MotionKeeper::MotionKeeper(Node& node, Node* target, HTimeRange const& range, MotionScope& scope)
    : m_node(node),
      m_known(&node),
      m_target(target),
      m_range(range),
      m_scope(scope),
      m_scene(scope.getScene()),
      m_before(scope.stateOf(node)),
      m_pre(node.getPreRotation()),
      m_back(m_pre.inverse()),
      m_origin(node.getPreTranslation()),
      m_channels{node.getTranslationChannel(), node.getRotationChannel(), node.getScaleChannel()} {
  for (size_t i = 0; i < m_channels.size(); ++i) m_defaults[i] = m_channels[i]->getDefaultValues();
}

bool MotionKeeper::isEverywhere() const { return !hasEnd(m_range.getStart()) && !hasEnd(m_range.getEnd()); }

int MotionKeeper::layerToWrite(NLEClip const* clip) const {
  if (clip == m_scene.getActiveClip()) return m_scene.getActiveLayer();
  int layer = 0;
  while (layer + 1 < clip->getNumLayers() && clip->isLayerLocked(layer)) ++layer;
  return layer;
}

// A value of the lowest layer, moved from the former parent's space, which stands still, to the new one's.
Values MotionKeeper::inNewSpace(Part part, MotionScope::Relation const& relation, Values const& own) const {
  auto const& [from, to] = relation.spaces;
  switch (part.kind) {
    case kTranslation: {
      Transform const place{m_origin + m_pre.rotate(Vec3(own.data())), {}, {1, 1, 1}};
      return rawValues(m_back.rotate(positionRelativeTo(to, (from * place).position) - m_origin));
    }
    case kRotation:
      return rawValues(m_back * to.rotation.inverse() * from.rotation * m_pre * rotationOf(own));
    case kScale:
      break;
  }
  return rawValues(quotients(scaled(Vec3(own.data()), from.scale), to.scale));
}

bool MotionKeeper::changes(Part part, MotionScope::Relation const& relation) const {
  if (part.kind == kRotation) return !part.same({0, 0, 0, 1}, inNewSpace(part, relation, {0, 0, 0, 1}));
  for (Values const& own : {Values{1, 1, 1}, Values{1000, 0, 0}, Values{0, 1000, 0}, Values{0, 0, 1000}})
    if (!part.same(own, inNewSpace(part, relation, own))) return true;
  return false;
}

void MotionKeeper::keepDefaults() {
  MotionScope::Relation const& relation = m_scope.relation(m_before.parent, m_target, nullptr);
  for (Part const part : {Part{kTranslation}, Part{kRotation}, Part{kScale}}) {
    Values& value = m_defaults[static_cast<size_t>(part.kind)];
    Values const moved =
        inNewSpace(part, relation, m_before.channels()[static_cast<size_t>(part.kind)]->byDefault);
    if (part.same(value, moved)) continue;
    m_finite = m_finite && isFinite(moved);
    Obstacle const obstacle = obstacleToDefault(*m_channels[static_cast<size_t>(part.kind)]);
    if (obstacle == Obstacle::none)
      value = moved;
    else
      cannotKeep(part, nullptr, reasonOf(obstacle));
  }
}

// All keys of a channel in a clip as they are in the new space, where the former one does not move against
// it. False when that does not do: a layer is locked, keys of single components would be turned, the default
// value shows and is not right.
bool MotionKeeper::moveKeys(Part part, NLEClip* clip, MotionScope::Relation const& relation) {
  Controller& channel = *m_channels[static_cast<size_t>(part.kind)];
  Values const byDefault = m_before.channels()[static_cast<size_t>(part.kind)]->byDefault;
  KeyTrack const* lowest = channel.findTrack(clip, 0);
  if ((!lowest || lowest->empty()) &&
      !part.same(inNewSpace(part, relation, byDefault), m_defaults[static_cast<size_t>(part.kind)]))
    return false;
  if (!changes(part, relation)) return true;

  Values const zero = inNewSpace(part, relation, {});
  std::vector<Change> moved;
  for (int layer = 0; layer < clip->getNumLayers(); ++layer) {
    KeyTrack const* track = channel.findTrack(clip, layer);
    // Layers above the lowest compose on the right, which the turn leaves as it is.
    if (!track || track->empty() || (layer > 0 && part.kind == kRotation)) continue;
    if (obstacleToKeys(channel, clip, layer) != Obstacle::none) return false;
    if (track->countHolding(KeyTrack::kAll) < track->count()) return false;
    moved.push_back({&channel, clip, layer, *track});
    moved.back().track.transform([&](double* values) {
      Values own{};
      std::copy_n(values, track->width(), own.data());
      own = inNewSpace(part, relation, own);
      m_finite = m_finite && isFinite(own);
      // What a further layer adds is moved as the difference of two places.
      for (int k = 0; k < track->width(); ++k)
        values[k] = own[static_cast<size_t>(k)] -
                    (layer > 0 && part.kind == kTranslation ? zero[static_cast<size_t>(k)] : 0);
    });
  }
  std::move(moved.begin(), moved.end(), std::back_inserter(m_changes));
  return true;
}

void MotionKeeper::keepInClip(NLEClip* clip) {
  MotionScope::Relation const& relation = m_scope.relation(m_before.parent, m_target, clip);
  std::optional<ClipMotion> motion;
  for (Part const part : {Part{kTranslation}, Part{kRotation}, Part{kScale}}) {
    if (part.kind == kScale && !relation.scales) continue;
    if (!relation.moves && isEverywhere() && moveKeys(part, clip, relation)) continue;
    if (!motion) motion.emplace(*this, clip, relation);
    motion->rekey(part);
  }
}

bool MotionKeeper::staysIn(NLEClip const* clip) const {
  MotionScope::Relation const& relation = m_scope.relation(m_before.parent, m_target, clip);
  return !relation.moves && !changes({kTranslation}, relation) && !changes({kRotation}, relation) &&
         !changes({kScale}, relation);
}

// A blend mixes what its sources hold, which is kept with them only where all of them are moved alike.
void MotionKeeper::warnOfBlend(NLEClip const* blend) {
  MotionScope::Relation const* first = nullptr;
  for (NLEClip* clip = m_scene.getHeadClip(); clip; clip = clip->getNext()) {
    if (!clip->holdsKeys()) continue;
    MotionScope::Relation const& relation = m_scope.relation(m_before.parent, m_target, clip);
    if (!first) first = &relation;
    if (relation.moves || relation.spaces != first->spaces)
      return cannotKeep({kTranslation}, blend, reasonOf(Obstacle::blendClip));
  }
}

void MotionKeeper::warnOfOtherClips() {
  std::string names;
  for (NLEClip* clip = m_scene.getHeadClip(); clip; clip = clip->getNext())
    if (clip != m_scene.getActiveClip() && clip->holdsKeys() && !staysIn(clip))
      names += (names.empty() ? "" : ", ") + clip->getName().GetString();
  if (!names.empty() && m_scope.isFirstWarning(m_node))
    writeLog(LogLevel::Warning, "The motion of " + m_node.getName().GetString() +
                                    " is kept in the active clip only and changes in: " + names);
}

void MotionKeeper::cannotKeep(Part part, NLEClip const* clip, char const* why) {
  if (m_problems++ > 0) return;
  m_problem = std::string(part.name()) +
              (clip ? " in the clip " + clip->getName().GetString() : " by default") + ": " + why;
}

void MotionKeeper::apply() {
  m_scope.remember(m_node);
  for (size_t i = 0; i < m_channels.size(); ++i) {
    if (m_defaults[i] == m_channels[i]->getDefaultValues()) continue;
    DataEdit const edit = DataEdit::ofDefault(*m_channels[i]);
    m_channels[i]->setDefaultValues(m_defaults[i]);
  }
  for (Change& change : m_changes) {
    DataEdit const edit(*change.channel, m_range);
    change.channel->setTrack(change.clip, change.layer, std::move(change.track));
  }
}

bool MotionKeeper::run() {
  NLEClip* active = m_scene.getActiveClip();
  if (isEverywhere() || !active) keepDefaults();
  if (isEverywhere()) {
    for (NLEClip* clip = m_scene.getHeadClip(); clip; clip = clip->getNext())
      if (clip->holdsKeys()) keepInClip(clip);
    if (active && !active->holdsKeys()) warnOfBlend(active);
  } else if (active && active->holdsKeys()) {
    keepInClip(active);
    warnOfOtherClips();
  } else if (active && !staysIn(active)) {
    cannotKeep({kTranslation}, active, reasonOf(Obstacle::blendClip));
  }

  if (m_finite)
    apply();
  else
    m_problem = "its values would be beyond what a number holds", m_problems = 1;
  if (m_problems > 0)
    writeLog(LogLevel::Warning,
             "The motion of " + m_node.getName().GetString() + " could not be kept: " + m_problem +
                 (m_problems > 1 ? " (and " + std::to_string(m_problems - 1) + " more)" : ""));
  return m_problems == 0;
}

bool Node::parentAdjust(Node* target, HTimeRange const& range) {
  if (range.isEmpty()) return true;
  if (target && (target == this || target->isDescendedFrom(this))) return false;
  MotionScope const own(*getDatabase());
  MotionScope& scope = *getDatabase()->getMotionScope();
  scope.start();
  if (scope.formerParent(this) == target) return true;
  return MotionKeeper(*this, target, range, scope).run();
}
