#include "host/scene/SceneReader.h"

#include <algorithm>
#include <functional>
#include <unordered_map>

#include "host/math/Quaternion.h"
#include "host/scene/Clips.h"
#include "host/scene/RawValues.h"

// --- states ---

ChannelState::ChannelState(Controller const& channel)
    : type(channel.getPropertyType()),
      interpolation(channel.getInterpolation()),
      byDefault(channel.getDefaultValues()) {
  channel.forEachTrack([this](NLEClip const* clip, int layer, KeyTrack const& keys) {
    layers.push_back({clip, layer, keys});
  });
}

KeyTrack const* ChannelState::find(NLEClip const* clip, int layer) const {
  for (Layer const& each : layers)
    if (each.clip == clip && each.layer == layer) return &each.keys;
  return nullptr;
}

bool ChannelState::hasKeysIn(NLEClip const* clip) const {
  return std::any_of(layers.begin(), layers.end(),
                     [&](Layer const& each) { return each.clip == clip && !each.keys.empty(); });
}

NodeState::NodeState(Node const& node)
    : parent(node.getNodeParent()),
      preTranslation(node.getPreTranslation()),
      preRotation(node.getPreRotation()),
      translation(*node.getTranslationChannel()),
      rotation(*node.getRotationChannel()),
      scale(*node.getScaleChannel()) {}

// --- channels ---

namespace {

// Times of a block: few enough that the blocks of a chain of nodes stay in the processor's cache.
constexpr size_t kBlock = 128;
constexpr size_t kPosition = 0, kRotation = 3, kScale = 7, kWidth = 10;  // of a world transform in doubles

void put(double const* world, double* matrix) {
  double const *q = world + kRotation, *s = world + kScale;
  double column[3];
  for (int c = 0; c < 3; ++c) {
    rotateByQuaternion(q, c == 0 ? s[0] : 0, c == 1 ? s[1] : 0, c == 2 ? s[2] : 0, column);
    for (int r = 0; r < 3; ++r) matrix[4 * r + c] = column[r];
  }
  for (int r = 0; r < 3; ++r) matrix[4 * r + 3] = world[kPosition + static_cast<size_t>(r)];
  for (int c = 0; c < 4; ++c) matrix[12 + c] = c == 3;
}

}  // namespace

// The keys of a channel in the reader's clips.
class SceneReader::Channel {
 public:
  Channel() = default;
  Channel(ChannelState const& state, std::span<NLEClip const* const> clips)
      : m_type(state.type), m_interpolation(state.interpolation), m_default(state.byDefault) {
    for (NLEClip const* clip : clips) {
      for (int layer = 0; layer < clip->getNumLayers(); ++layer) {
        KeyTrack const* track = state.find(clip, layer);
        bool const keyed = track && !track->empty();
        m_constant = m_constant && !keyed;
        m_keys.push_back(keyed ? *track : KeyTrack(Controller::shapeOf(m_type)));
      }
      m_ends.push_back(m_keys.size());
    }
    if (m_constant) m_keys.clear();
  }

  bool isConstant() const { return m_constant; }
  void includeKeys(HTimeRange& range) const {
    for (KeyTrack const& track : m_keys)
      if (!track.empty()) range.include(HTimeRange(track.timeAt(0), track.timeAt(track.count() - 1)));
  }
  KeyTrack::Values const& getDefault() const { return m_default; }

  // `weights`: of each clip of a blend at the times; none: a clip by itself.
  void sample(SampleTimes const& times, std::span<double const* const> weights,
              std::vector<double>& out) const {
    auto const each = static_cast<size_t>(Controller::shapeOf(m_type)) * static_cast<size_t>(times.count());
    out.resize(each);
    if (weights.empty()) return keysOf(0).sample(times, out.data());
    std::vector<double> values(each * m_ends.size());
    std::vector<double const*> parts;
    for (size_t clip = 0; clip < m_ends.size(); ++clip) {
      keysOf(clip).sample(times, values.data() + clip * each);
      parts.push_back(values.data() + clip * each);
    }
    blendSamples(m_type, m_default, parts, weights, static_cast<size_t>(times.count()), out.data());
  }

 private:
  struct Layers : LayeredKeys {
    std::vector<KeyTrack const*> tracks;
    void sample(SampleTimes const& times, double* out) {
      layers = tracks;
      LayeredKeys::sample(times, out);
    }
  };
  Layers keysOf(size_t clip) const {
    Layers keys{{m_type, m_interpolation, m_default, {}}, {}};
    for (size_t i = clip ? m_ends[clip - 1] : 0; i < m_ends[clip]; ++i) keys.tracks.push_back(&m_keys[i]);
    return keys;
  }

  DataSource::PropertyType m_type = DataSource::NoProperty;
  Interpolation m_interpolation = Interpolation::Linear;
  KeyTrack::Values m_default{};
  bool m_constant = true;
  std::vector<KeyTrack> m_keys;  // clip by clip, layer by layer
  std::vector<size_t> m_ends;    // of each clip's layers
};

struct SceneReader::Source {
  NLEClip const* clip;
  Channel weight;
};

// A node, or one above nodes.
struct SceneReader::Joint {
  int depth;
  bool turned;  // has a pre-rotation
  Vec3 preTranslation;
  TalixRotation preRotation;
  Channel translation, rotation, scale;
  std::vector<int> results;  // which nodes of the reader it is
  bool stands = false;       // it and all above it are constant
  bool still = false;        // and its world transform has been worked out:
  double world[kWidth]{};
};

// --- making a reader ---

SceneReader::SceneReader(std::span<Node const* const> nodes, NLEClip const* clip, Former const& former)
    : m_numNodes(static_cast<int>(nodes.size())) {
  if (clip && clip->holdsKeys()) m_sources.push_back({clip, {}});
  if (clip && !clip->holdsKeys()) {
    m_blends = true;
    MultiModAttribute const* sources = static_cast<BlendClip const*>(clip)->getSources();
    for (int i = 0; i < sources->getNumModules(); ++i) {
      auto const* source = objectAs<NLEClip>(sources->getModuleValue(i));
      if (source && source->holdsKeys())
        m_sources.push_back({source, Channel(ChannelState(*source->getWeightChannel()), {{source}})});
    }
  }
  std::vector<NLEClip const*> clips;
  for (Source const& source : m_sources) clips.push_back(source.clip);

  struct Entry {
    std::vector<int> results;
    std::vector<Node const*> children;
  };
  std::unordered_map<Node const*, Entry> entries;
  std::unordered_map<Node const*, NodeState> states;
  std::vector<Node const*> roots;
  auto const stateOf = [&](Node const* node) -> NodeState const& {
    NodeState const* other = former ? former(node) : nullptr;
    return other ? *other : states.try_emplace(node, *node).first->second;
  };
  for (size_t i = 0; i < nodes.size(); ++i) {
    bool known = entries.contains(nodes[i]);
    entries[nodes[i]].results.push_back(static_cast<int>(i));
    for (Node const* node = nodes[i]; !known;) {
      Node const* parent = stateOf(node).parent;
      known = !parent || entries.contains(parent);
      (parent ? entries[parent].children : roots).push_back(node);
      node = parent;
    }
  }

  std::vector<std::pair<Node const*, int>> open;
  for (auto root = roots.rbegin(); root != roots.rend(); ++root) open.emplace_back(*root, 0);
  m_joints.reserve(entries.size());
  while (!open.empty()) {
    auto const [node, depth] = open.back();
    open.pop_back();
    NodeState const& state = stateOf(node);
    Entry& entry = entries[node];
    m_joints.push_back({depth, !(state.preRotation == TalixRotation()), state.preTranslation,
                        state.preRotation, Channel(state.translation, clips), Channel(state.rotation, clips),
                        Channel(state.scale, clips), std::move(entry.results)});
    m_depth = std::max(m_depth, depth + 1);
    for (auto child = entry.children.rbegin(); child != entry.children.rend(); ++child)
      open.emplace_back(*child, depth + 1);
  }
  workOutStill();
}

SceneReader::~SceneReader() = default;
SceneReader::SceneReader(SceneReader&&) noexcept = default;

// --- reading ---

// Doubles of one kind at the times of a block: one after the other, or one for all.
struct SceneReader::Run {
  double const* data = nullptr;
  size_t step = 0;

  double const* at(size_t i) const { return data + i * step; }
};

// What one call of readWorld works in.
class SceneReader::Pass {
 public:
  explicit Pass(SceneReader const& reader)
      : m_reader(reader),
        m_worlds(static_cast<size_t>(reader.m_depth) * kBlock * kWidth),
        m_above(reader.m_depth + 1) {}

  // visit(joint, its world transforms) for every joint.
  template <class Visit>
  void run(SampleTimes const& times, Visit visit) {
    m_times = &times;
    m_count = static_cast<size_t>(times.count());
    weigh();
    for (Joint const& joint : m_reader.m_joints) {
      Run& world = m_above[static_cast<size_t>(joint.depth) + 1];
      world = joint.still ? Run{joint.world, 0} : compose(joint);
      visit(joint, world);
    }
  }

 private:
  void weigh() {
    if (!m_reader.m_blends) return;
    m_weights.resize(m_reader.m_sources.size());
    m_weightRuns.clear();
    for (size_t i = 0; i < m_weights.size(); ++i) {
      Channel const& weight = m_reader.m_sources[i].weight;
      if (weight.isConstant())
        m_weights[i].assign(m_count, weight.getDefault()[0]);
      else
        weight.sample(*m_times, {}, m_weights[i]);
      m_weightRuns.push_back(m_weights[i].data());
    }
  }

  Run read(Channel const& channel, size_t width, std::vector<double>& values) const {
    if (channel.isConstant()) return {channel.getDefault().data(), 0};
    channel.sample(*m_times, m_weightRuns, values);
    return {values.data(), width};
  }

  Run compose(Joint const& joint) {
    Run const translation = read(joint.translation, 3, m_translations);
    Run const rotation = read(joint.rotation, 4, m_rotations);
    Run const scale = read(joint.scale, 3, m_scales);
    double preRotation[4];
    joint.preRotation.getQuaternion(preRotation);
    Vec3 const& pre = joint.preTranslation;
    Run const& above = m_above[static_cast<size_t>(joint.depth)];
    double* out = m_worlds.data() + static_cast<size_t>(joint.depth) * kBlock * kWidth;
    Run const result{out, kWidth};
    for (size_t i = 0; i < m_count; ++i, out += kWidth) {
      double const *t = translation.at(i), *q = rotation.at(i), *s = scale.at(i);
      double position[3], turned[4];
      if (joint.turned) {
        rotateByQuaternion(preRotation, t[0], t[1], t[2], position);
        multiplyQuaternions(preRotation, q, turned);
        t = position;
        q = turned;
      }
      double const x = pre.x + t[0], y = pre.y + t[1], z = pre.z + t[2];
      if (joint.depth == 0) {
        out[0] = x, out[1] = y, out[2] = z;
        std::copy_n(q, 4, out + kRotation);
        std::copy_n(s, 3, out + kScale);
        continue;
      }
      double const *p = above.at(i), *ps = p + kScale;
      rotateByQuaternion(p + kRotation, x * ps[0], y * ps[1], z * ps[2], out);
      for (size_t k = 0; k < 3; ++k) out[k] += p[k], out[kScale + k] = ps[k] * s[k];
      multiplyQuaternions(p + kRotation, q, out + kRotation);
    }
    return result;
  }

  SceneReader const& m_reader;
  SampleTimes const* m_times = nullptr;
  size_t m_count = 0;
  std::vector<std::vector<double>> m_weights;
  std::vector<double const*> m_weightRuns;
  std::vector<double> m_translations, m_rotations, m_scales;
  std::vector<double> m_worlds;  // a block for each depth
  std::vector<Run> m_above;      // the worlds of the joints above the present one, from depth 1 on
};

// Constant joints below constant ones are worked out once.
void SceneReader::workOutStill() {
  std::vector<bool> still(static_cast<size_t>(m_depth) + 1);
  still[0] = true;
  for (Joint& joint : m_joints)
    still[static_cast<size_t>(joint.depth) + 1] = joint.stands =
        still[static_cast<size_t>(joint.depth)] && joint.translation.isConstant() &&
        joint.rotation.isConstant() && joint.scale.isConstant();
  Pass(*this).run(SampleTimes(0, 1, 1), [](Joint const& joint, Run const& world) {
    if (joint.stands) std::copy_n(world.data, kWidth, const_cast<Joint&>(joint).world);
  });
  for (Joint& joint : m_joints) joint.still = joint.stands;
}

HTimeRange SceneReader::getMotionRange() const {
  HTimeRange range;
  for (Source const& source : m_sources) source.weight.includeKeys(range);
  for (Joint const& joint : m_joints)
    for (Channel const* channel : {&joint.translation, &joint.rotation, &joint.scale})
      channel->includeKeys(range);
  return range;
}

void SceneReader::readWorld(SampleTimes const& times, Arrays const& arrays) const {
  auto const nodes = static_cast<size_t>(m_numNodes);
  Pass pass(*this);
  auto const all = static_cast<size_t>(times.count());
  for (size_t first = 0; first < all; first += kBlock) {
    size_t const count = std::min(kBlock, all - first);
    pass.run(times.part(static_cast<int64>(first), static_cast<int64>(count)),
             [&](Joint const& joint, Run const& world) {
               for (int const result : joint.results) {
                 size_t place = first * nodes + static_cast<size_t>(result);
                 for (size_t i = 0; i < count; ++i, place += nodes) {
                   double const* one = world.at(i);
                   if (arrays.positions) std::copy_n(one + kPosition, 3, arrays.positions + 3 * place);
                   if (arrays.rotations) std::copy_n(one + kRotation, 4, arrays.rotations + 4 * place);
                   if (arrays.scales) std::copy_n(one + kScale, 3, arrays.scales + 3 * place);
                   if (arrays.matrices) put(one, arrays.matrices + 16 * place);
                 }
               }
             });
  }
}

std::vector<Transform> SceneReader::readWorld(SampleTimes const& times) const {
  size_t const count = static_cast<size_t>(times.count() * m_numNodes);
  std::vector<double> positions(3 * count), rotations(4 * count), scales(3 * count);
  readWorld(times, {positions.data(), rotations.data(), scales.data(), nullptr});
  std::vector<Transform> transforms(count);
  for (size_t i = 0; i < count; ++i) {
    transforms[i].position = Vec3(positions.data() + 3 * i);
    transforms[i].rotation.setQuaternion(rotations.data() + 4 * i);
    transforms[i].scale = Vec3(scales.data() + 3 * i);
  }
  return transforms;
}
