#include "host/scene/motion/MotionScope.h"

#include <algorithm>
#include <utility>

#include "host/scene/Database.h"
#include "host/scene/KeyTimes.h"

MotionScope::MotionScope(Database& scene) : m_scene(scene), m_outermost(scene.getMotionScope() == nullptr) {
  if (m_outermost) scene.setMotionScope(this);
}

MotionScope::~MotionScope() {
  if (m_outermost) m_scene.setMotionScope(nullptr);
}

void MotionScope::start() {
  if (std::exchange(m_started, true)) return;
  for (int i = 0; i < m_scene.getNumNodes(); ++i)
    m_parents.emplace(m_scene.getNode(i), m_scene.getNode(i)->getNodeParent());
}

Node const* MotionScope::formerParent(Node const* node) const {
  auto const found = m_parents.find(node);
  return found == m_parents.end() ? node->getNodeParent() : found->second;
}

void MotionScope::remember(Node const& node) {
  auto const [entry, isNew] = m_former.try_emplace(&node, node);
  if (isNew) entry->second.parent = formerParent(&node);
}

NodeState const* MotionScope::former(Node const* node) {
  auto const found = m_former.find(node);
  if (found != m_former.end()) return &found->second;
  if (formerParent(node) == node->getNodeParent()) return nullptr;
  remember(*node);
  return &m_former.at(node);
}

NodeState MotionScope::stateOf(Node const& node) const {
  auto const found = m_former.find(&node);
  if (found != m_former.end()) return found->second;
  NodeState state(node);
  state.parent = formerParent(&node);
  return state;
}

MotionScope::Relation const& MotionScope::relation(Node const* parent, Node const* target,
                                                   NLEClip const* clip) {
  auto const [entry, isNew] = m_relations.try_emplace({parent, target, clip});
  Relation& relation = entry->second;
  if (!isNew) return relation;

  std::vector<Node const*> before, after;
  for (Node const* node = parent; node; node = formerParent(node)) before.push_back(node);
  for (Node const* node = target; node; node = node->getNodeParent()) after.push_back(node);
  auto const collect = [&](std::vector<Node const*> const& chain, std::vector<Node const*> const& other,
                           bool then) {
    for (Node const* node : chain) {
      NodeState const state = then ? stateOf(*node) : NodeState(*node);
      // What is above both cancels out, as long as it does not scale, since transforms do not shear.
      bool const shared =
          std::find(other.begin(), other.end(), node) != other.end() && !m_former.contains(node);
      for (ChannelState const* channel : state.channels()) {
        mergeKeyTimes(relation.times, *channel, clip);
        relation.moves |= channel->hasKeysIn(clip) && (!shared || channel == &state.scale);
      }
      relation.scales |= state.scale.hasKeysIn(clip) || state.scale.byDefault != KeyTrack::Values{1, 1, 1};
    }
  };
  collect(before, after, true);
  collect(after, before, false);
  auto const at = [&](Node const* node, SceneReader::Former const& then) {
    return node ? SceneReader({&node, 1}, clip, then).readWorld(SampleTimes(0, 1, 1))[0] : Transform();
  };
  relation.spaces = {at(parent, [this](Node const* node) { return former(node); }), at(target, {})};
  return relation;
}
