#include "host/scene/motion/RootMotion.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <unordered_map>

#include "host/keys/DataRanges.h"
#include "host/scene/Database.h"
#include "host/scene/HTimeManager.h"
#include "host/scene/KeyTimes.h"
#include "host/scene/SceneScope.h"

namespace {

using Times = KeyTimes;

// Motion over more frames than these is followed at its keys only.
constexpr int64 kMostFrames = 1'000'000;

std::array<Controller*, 3> transformChannels(Node const& node) {
  return {node.getTranslationChannel(), node.getRotationChannel(), node.getScaleChannel()};
}

bool turns(TalixRotation const& rotation) { return !(rotation == TalixRotation()); }

Times keyTimes(Controller const& channel, NLEClip const* clip) {
  Times times;
  mergeKeyTimes(times, channel, *clip);
  return times;
}

Times merged(Times times, Times const& more) {
  mergeTimes(times, more);
  return times;
}

// --- the frames that the markers are in ---

// Of a node and all above it.
struct Frame {
  Transform still;      // in the world, by default values
  unsigned moving = 0;  // a bit for each clip of the scene in which one of them has keys

  bool isWorld() const {
    return still.position == Vec3() && !turns(still.rotation) && still.scale == Vec3(1, 1, 1);
  }
};

class Frames {
 public:
  // Of a parent node; the world without one.
  Frame const& of(Node const* node) {
    std::vector<Node const*> unknown;
    for (; node && !m_frames.contains(node); node = node->getNodeParent()) unknown.push_back(node);
    Frame const* frame = node ? &m_frames.at(node) : &m_world;
    for (auto next = unknown.rbegin(); next != unknown.rend(); ++next)
      frame = &m_frames.emplace(*next, below(*frame, **next)).first->second;
    return *frame;
  }

 private:
  static Frame below(Frame const& parent, Node const& node) {
    const Transform own{node.getPreTranslation() + node.getPreRotation().rotate(node.getConstLocalPos()),
                        node.getConstLocalRot(false), node.getConstLocalScale()};
    Frame frame{parent.still * own, parent.moving};
    unsigned bit = 1;
    for (NLEClip* clip = g_db->getHeadClip(); clip; clip = clip->getNext(), bit <<= 1)
      for (Controller const* channel : transformChannels(node))
        if (channel->hasKeysInClip(clip)) frame.moving |= bit;
    return frame;
  }

  Frame m_world;
  std::unordered_map<Node const*, Frame> m_frames;
};

// --- local values of a root ---

// What a node's channels must hold for it to be somewhere as a root. Its pre-transform stays.
class AsRoot {
 public:
  explicit AsRoot(Node const& node)
      : m_pre(node.getPreRotation()), m_back(m_pre.inverse()), m_origin(node.getPreTranslation()) {}

  Vec3 translation(Transform const& world) const { return m_back.rotate(world.position - m_origin); }
  TalixRotation rotation(Transform const& world) const { return m_back * world.rotation; }

  // The same for a node whose own values are known, below a frame.
  Vec3 translation(Transform const& frame, Vec3 const& own) const {
    return m_back.rotate(frame.position - m_origin +
                         frame.rotation.rotate(scaled(m_origin + m_pre.rotate(own), frame.scale)));
  }
  // Of what a layer adds.
  Vec3 addition(Transform const& frame, Vec3 const& own) const {
    return m_back.rotate(frame.rotation.rotate(scaled(m_pre.rotate(own), frame.scale)));
  }
  TalixRotation turn(Transform const& frame) const { return m_back * frame.rotation * m_pre; }

 private:
  TalixRotation m_pre, m_back;
  Vec3 m_origin;
};

void store(Controller* channel, NLEClip* clip, int layer, KeyTrack track) {
  channel->beginDataEdit(HTimeRange::forever());
  channel->setTrack(clip, layer, std::move(track));
  channel->endDataEdit();
}

// Keys of single components do not survive a turn.
bool hasPartialKeys(Controller const& channel, NLEClip const* clip) {
  for (int layer = 0; layer < clip->getNumLayers(); ++layer) {
    KeyTrack const* track = channel.findTrack(clip, layer);
    if (track && track->countHolding(KeyTrack::kAll) < track->count()) return true;
  }
  return false;
}

// Below a frame that stands still in the clip: every key takes its value as a root.
void moveKeys(Node const& node, Transform const& frame, NLEClip* clip) {
  const AsRoot asRoot(node);
  const auto change = [&](Controller* channel, auto changeValues) {
    for (int layer = 0; layer < clip->getNumLayers(); ++layer) {
      KeyTrack const* present = channel->findTrack(clip, layer);
      if (!present || present->empty()) continue;
      KeyTrack track = *present;
      track.transform([&](double* values) { changeValues(layer, values); });
      store(channel, clip, layer, std::move(track));
    }
  };
  change(node.getTranslationChannel(), [&](int layer, double* values) {
    const Vec3 own(values);
    (layer == 0 ? asRoot.translation(frame, own) : asRoot.addition(frame, own)).getValue(values);
  });
  // Layers above the lowest compose on the right, and so stay.
  const TalixRotation turn = asRoot.turn(frame);
  if (turns(turn))
    change(node.getRotationChannel(), [&](int layer, double* values) {
      TalixRotation own;
      own.setQuaternion(values);
      if (layer == 0) (turn * own).getQuaternion(values);
    });
  if (!(frame.scale == Vec3(1, 1, 1)))
    change(node.getScaleChannel(),
           [&](int, double* values) { scaled(Vec3(values), frame.scale).getValue(values); });
}

void moveDefaults(Node& node, Transform const& frame) {
  const AsRoot asRoot(node);
  const Vec3 position = asRoot.translation(frame, node.getConstLocalPos());
  const TalixRotation rotation = asRoot.turn(frame) * node.getConstLocalRot(true);
  node.setConstLocalPos(position);
  node.setConstLocalRot(rotation, true);
  node.setConstLocalScale(scaled(node.getConstLocalScale(), frame.scale));
}

// --- frames that move ---

// One clip, which is active meanwhile.
class Baking {
 public:
  explicit Baking(NLEClip* clip) : m_clip(clip) {}

  void bake(Marker const& marker, Frame const& frame, bool moves);

 private:
  struct NewTrack {
    NewTrack(Controller* its, Times when)
        : channel(its), times(std::move(when)), track(Controller::shapeOf(its->getPropertyType())) {}
    Controller* channel;
    Times times;
    KeyTrack track;
    bool varies = false;  // some value is not the default one to come
  };

  Times const& frameTimes(Node const* parent);
  Times timesOf(Marker const& marker, bool moves);
  void put(NewTrack& made) const;

  NLEClip* m_clip;
  std::unordered_map<Node const*, Times> m_frameTimes;
};

// When a parent or anything above it has a key, and the whole frames between.
Times const& Baking::frameTimes(Node const* parent) {
  const auto [entry, isNew] = m_frameTimes.try_emplace(parent);
  Times& times = entry->second;
  if (!isNew) return times;
  for (Node const* node = parent; node; node = node->getNodeParent())
    for (Controller const* channel : transformChannels(*node)) mergeKeyTimes(times, *channel, *m_clip);
  if (times.empty()) return times;
  const int64 period = HTimeManager::getInstance()->getTicksPerFrame();
  const int64 first = times.front() / period, last = times.back() / period;
  if (last - first > kMostFrames) return times;
  Times frames;
  for (int64 time = first * period; time <= last * period; time += period)
    if (time > times.front() && time < times.back()) frames.push_back(time);
  mergeTimes(times, frames);
  return times;
}

Times Baking::timesOf(Marker const& marker, bool moves) {
  Times own = keyTimes(*marker.getTranslationChannel(), m_clip);
  if (!moves) return own;
  Times const& follow = frameTimes(marker.getNodeParent());
  KeyTrack const* data = marker.getTranslationChannel()->findDataTrack(m_clip);
  // One with an empty track belongs to the clip and was never seen.
  if (!data && marker.getTranslationChannel()->findTrack(m_clip, 0)) return own;
  if (!data) return merged(own, follow);
  Times bridged;
  const DataRanges ranges(*data, 1);
  std::copy_if(follow.begin(), follow.end(), std::back_inserter(bridged),
               [&](int64 time) { return ranges.hasDataAt(time); });
  return merged(own, bridged);
}

// Replaces the keys of all layers by those of one; key selection stays.
void Baking::put(NewTrack& made) const {
  if (KeyTrack const* data = made.channel->findDataTrack(m_clip)) DataRanges::bridgeAlike(made.track, *data);
  for (int layer = 0; layer < m_clip->getNumLayers(); ++layer) {
    KeyTrack const* former = made.channel->findTrack(m_clip, layer);
    if (!former) continue;
    for (int64 i = 0; i < former->countSelected(); ++i) {
      const KeyTrack::Key key = former->at(former->selectedIndex(i));
      const int64 index = made.track.find(key.time);
      made.track.setSelected(index, made.track.at(index).selected | key.selected);
    }
    if (layer > 0 && !former->empty()) store(made.channel, m_clip, layer, KeyTrack(made.track.shape()));
  }
  store(made.channel, m_clip, 0, std::move(made.track));
}

void Baking::bake(Marker const& marker, Frame const& frame, bool moves) {
  const Times positioned = timesOf(marker, moves);
  const auto trackOf = [&](Controller* channel) {
    return NewTrack(channel, merged(keyTimes(*channel, m_clip), positioned));
  };
  NewTrack translation(marker.getTranslationChannel(), positioned);
  NewTrack rotation = trackOf(marker.getRotationChannel()), scale = trackOf(marker.getScaleChannel());

  const AsRoot asRoot(marker);
  const TalixRotation usual = asRoot.turn(frame.still) * marker.getConstLocalRot(true);
  const Vec3 usualScale = scaled(marker.getConstLocalScale(), frame.still.scale);
  const auto holds = [](Times const& times, int64 time) {
    return std::binary_search(times.begin(), times.end(), time);
  };
  for (const int64 time : merged(rotation.times, scale.times)) {
    const Transform world = marker.getWorldTransform(time);
    KeyTrack::Values values{};
    if (holds(translation.times, time)) {
      asRoot.translation(world).getValue(values.data());
      translation.track.set(time, values);
    }
    if (holds(rotation.times, time)) {
      const TalixRotation own = asRoot.rotation(world);
      Vec3 off;
      (usual.inverse() * own).getAsVector(off);
      rotation.varies = rotation.varies || off.length() > 1e-9;
      own.getQuaternion(values.data());
      rotation.track.set(time, values);
    }
    if (holds(scale.times, time)) {
      scale.varies = scale.varies || (world.scale - usualScale).length() > 1e-9;
      world.scale.getValue(values.data());
      scale.track.set(time, values);
    }
  }
  if (!translation.track.empty()) put(translation);
  for (NewTrack* made : {&rotation, &scale})
    if (made->varies || made->channel->hasKeysInClip(m_clip)) put(*made);
}

// Makes clips active for a while.
class ActiveClip {
 public:
  ActiveClip() : m_clip(g_db->getActiveClip()), m_layer(g_db->getActiveLayer()) {}
  ~ActiveClip() {
    if (!m_changed) return;
    g_db->setActiveClip(m_clip);
    if (m_clip) g_db->setActiveLayer(m_layer);
  }
  ActiveClip(ActiveClip const&) = delete;
  ActiveClip& operator=(ActiveClip const&) = delete;

  void use(NLEClip* clip) {
    if (g_db->getActiveClip() == clip) return;
    m_changed = true;
    g_db->setActiveClip(clip);
  }

 private:
  NLEClip* m_clip;
  int m_layer;
  bool m_changed = false;
};

}  // namespace

void keepMotionAsRoots(std::vector<Marker*> const& markers) {
  // Children first: what a marker does hangs on its parents as they were.
  if (markers.empty()) return;
  const SceneScope scope(*markers.front()->getDatabase());
  Frames frames;
  std::vector<std::pair<Marker*, Frame const*>> concerned;
  for (auto marker = markers.rbegin(); marker != markers.rend(); ++marker) {
    Frame const& frame = frames.of((*marker)->getNodeParent());
    if (frame.moving || !frame.isWorld()) concerned.emplace_back(*marker, &frame);
  }
  if (concerned.empty()) return;

  ActiveClip active;
  unsigned bit = 1;
  for (NLEClip* clip = g_db->getHeadClip(); clip; clip = clip->getNext(), bit <<= 1) {
    if (!clip->holdsKeys()) continue;
    Baking baking(clip);
    for (auto const& [marker, frame] : concerned) {
      const bool moves = (frame->moving & bit) != 0;
      if (!moves && frame->isWorld()) continue;
      if (moves || hasPartialKeys(*marker->getTranslationChannel(), clip) ||
          hasPartialKeys(*marker->getScaleChannel(), clip)) {
        active.use(clip);
        baking.bake(*marker, *frame, moves);
      } else {
        moveKeys(*marker, frame->still, clip);
      }
    }
  }
  for (auto const& [marker, frame] : concerned) moveDefaults(*marker, frame->still);
}
