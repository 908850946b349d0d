#include "host/scene/Node.h"

#include <algorithm>

#include "host/scene/ChangeSetBuilder.h"
#include "host/scene/DataEdit.h"
#include "host/scene/Database.h"
#include "host/scene/Editability.h"
#include "host/scene/HTimeManager.h"
#include "host/scene/RawValues.h"

H_DEFINE_CLASS(Node);

// --- world transforms and their cache ---

namespace {

int64 now(Node const& node) { return node.getDatabase()->getTimeManager()->getTime(); }

}  // namespace

void Node::markMoved(Module* module) noexcept {
  uint64 const epoch = module->getDatabase()->m_worldCache.epoch;
  auto const* top = objectAs<Node>(module);
  if (top && top->m_worldEpoch != epoch) return;
  try {
    std::vector<Module*> open{module};
    while (!open.empty()) {
      Module* next = open.back();
      open.pop_back();
      if (auto* node = objectAs<Node>(next)) {
        if (node->m_worldEpoch != epoch) continue;
        node->m_worldEpoch = 0;
      }
      for (int i = 0; i < next->getNumChildren(); ++i) open.push_back(next->getChild(i));
    }
  } catch (std::bad_alloc const&) {
    module->getDatabase()->forgetWorldCache();
  }
}

Transform Node::getWorldTransform(int64 time) const {
  Database& scene = *getDatabase();
  scene.checkThread();
  Database::WorldCache& cache = scene.m_worldCache;
  if (time != cache.time) {
    cache.time = time;
    ++cache.epoch;
  }
  if (m_worldEpoch == cache.epoch) return m_world;
  Node const* parent = getNodeParent();
  if (!parent || parent->m_worldEpoch == cache.epoch) return cacheBelow(parent, time);
  std::vector<Node const*> chain{this};
  for (; parent && parent->m_worldEpoch != cache.epoch; parent = parent->getNodeParent())
    chain.push_back(parent);
  for (auto node = chain.rbegin(); node != chain.rend(); ++node) {
    (*node)->cacheBelow(parent, time);
    parent = *node;
  }
  return m_world;
}

Transform const& Node::cacheBelow(Node const* parent, int64 time) const {
  Transform const own = inParent(time);
  m_world = parent ? parent->m_world * own : own;
  m_worldEpoch = getDatabase()->m_worldCache.epoch;
  return m_world;
}

// --- life ---

Node::~Node() = default;

void Node::setUp() {
  Module::setUp();
  static Attribute::Labels const orders = std::make_shared<std::vector<HString> const>(
      std::vector<HString>{"XYZ", "XZY", "YXZ", "YZX", "ZXY", "ZYX"});
  m_translation = static_cast<Vec3Controller*>(addChannel("Translation", DataSource::Vec3Property));
  m_rotation = static_cast<RotController*>(addChannel("Rotation", DataSource::RotProperty));
  m_scale = static_cast<Vec3Controller*>(addChannel("Scale", DataSource::Vec3Property));
  m_scale->setConstValue({1, 1, 1}, false, false);
  m_rotationOrder = addBuiltIn<EnumAttribute>("RotationOrder", orders);
}

void Node::dataChanged(Controller const* channel) {
  if (!channel || channel == m_translation || channel == m_rotation || channel == m_scale) markMoved(this);
}

TalixRotation::RotOrder Node::getRotationOrder() const {
  return static_cast<TalixRotation::RotOrder>(m_rotationOrder->getIndex());
}

bool Node::setRotationOrder(TalixRotation::RotOrder order) {
  return m_rotationOrder->setIndex(order, true, true, true, true);
}

// --- reading ---

Vec3 Node::getLocalPos(int64 time) const { return m_translation->getValue(time); }
TalixRotation Node::getLocalRot(int64 time) const { return m_rotation->getValue(time); }
Vec3 Node::getLocalScale(int64 time) const { return m_scale->getValue(time); }

Transform Node::inParent(int64 time) const {
  return {m_preTranslation + m_preRotation.rotate(getLocalPos(time)), m_preRotation * getLocalRot(time),
          getLocalScale(time)};
}

Transform Node::parentWorld(int64 time) const {
  Node const* parent = getNodeParent();
  return parent ? parent->getWorldTransform(time) : Transform();
}

Vec3 Node::getWSPos(int64 time) const { return getWorldTransform(time).position; }
TalixRotation Node::getWSRot(int64 time) const { return getWorldTransform(time).rotation; }
Vec3 Node::getWSScale(int64 time) const { return getWorldTransform(time).scale; }

namespace {

// What `space` (null: the world) sees of a world transform.
Transform relativeTo(Node const* space, int64 time, Transform const& world) {
  return space ? world.relativeTo(space->getWorldTransform(time)) : world;
}

}  // namespace

Vec3 Node::getPosInSpaceOfNode(int64 time, Node* space) const {
  return relativeTo(space, time, getWorldTransform(time)).position;
}

TalixRotation Node::getRotInSpaceOfNode(int64 time, Node* space) const {
  return relativeTo(space, time, getWorldTransform(time)).rotation;
}

Vec3 Node::getScaleInSpaceOfNode(int64 time, Node* space) const {
  return relativeTo(space, time, getWorldTransform(time)).scale;
}

Vec3 Node::getConstLocalPos() const { return m_translation->getConstValue(); }

TalixRotation Node::getConstLocalRot(bool withoutPre) const {
  return withoutPre ? m_rotation->getConstValue() : m_preRotation * m_rotation->getConstValue();
}

Vec3 Node::getConstLocalScale() const { return m_scale->getConstValue(); }

Transform Node::constInParent() const {
  return {m_preTranslation + m_preRotation.rotate(getConstLocalPos()), getConstLocalRot(false),
          getConstLocalScale()};
}

Transform Node::constWorld() const {
  std::vector<Node const*> chain;
  for (Node const* node = this; node; node = node->getNodeParent()) chain.push_back(node);
  Transform world;
  for (auto node = chain.rbegin(); node != chain.rend(); ++node) world = world * (*node)->constInParent();
  return world;
}

Transform Node::constParentWorld() const {
  Node const* parent = getNodeParent();
  return parent ? parent->constWorld() : Transform();
}

Vec3 Node::getConstWSPos() const { return constWorld().position; }
TalixRotation Node::getConstWSRot() const { return constWorld().rotation; }
Vec3 Node::getConstWSScale() const { return constWorld().scale; }

Vec3 Node::getConstPosInSpaceOfNode(Node const* space) const {
  return space ? constWorld().relativeTo(space->constWorld()).position : getConstWSPos();
}

TalixRotation Node::getConstRotInSpaceOfNode(Node const* space) const {
  return space ? constWorld().relativeTo(space->constWorld()).rotation : getConstWSRot();
}

Vec3 Node::getConstScaleInSpaceOfNode(Node const* space) const {
  return space ? constWorld().relativeTo(space->constWorld()).scale : getConstWSScale();
}

Vec3 Node::getPreTranslationWS() const { return getPreTranslationInSpaceOfNode(nullptr); }

TalixRotation Node::getPreRotationWS() const { return getPreRotationInSpaceOfNode(nullptr); }

Vec3 Node::getPreTranslationInSpaceOfNode(Node* space) const {
  return relativeTo(space, now(*this), parentWorld(now(*this)) * Transform{m_preTranslation, {}, {1, 1, 1}})
      .position;
}

TalixRotation Node::getPreRotationInSpaceOfNode(Node* space) const {
  return relativeTo(space, now(*this), parentWorld(now(*this)) * Transform{{}, m_preRotation, {1, 1, 1}})
      .rotation;
}

// --- writing ---

Vec3 Node::translationFor(Vec3 const& inParent) const {
  return m_preRotation.inverse().rotate(inParent - m_preTranslation);
}

bool Node::writeAt(Controller* channel, int64 time, Controller::Values const& values) {
  // Of a rotation three of its four numbers, which are always finite.
  auto const canBeHeld = [](Controller::Values const& all) { return isFinite(Vec3(all.data())); };
  if (!canBeHeld(values)) return false;
  if (obstacleToValue(*channel) != Obstacle::none) return true;
  if (!getDatabase()->getActiveClip()) {
    DataEdit const edit = DataEdit::ofDefault(*channel);
    channel->setDefaultValues(values);
    return true;
  }
  Controller::Values const inLayer = channel->solveLayer(time, values);
  if (!canBeHeld(inLayer)) return false;
  DataEdit const edit(*channel, HTimeRange(time, time));
  channel->writeKeyAt(time, inLayer, KeyTrack::kAll);
  return true;
}

bool Node::setLocalPos(int64 time, Vec3 const& position) {
  return writeAt(m_translation, time, rawValues(position));
}

bool Node::setWSPos(int64 time, Vec3 const& position) {
  return setLocalPos(time, translationFor(positionRelativeTo(parentWorld(time), position)));
}

void Node::setLocalRot(int64 time, TalixRotation const& rotation) {
  writeAt(m_rotation, time, rawValues(rotation));
}

void Node::setWSRot(int64 time, TalixRotation const& rotation) {
  setLocalRot(time, (parentWorld(time).rotation * m_preRotation).inverse() * rotation);
}

bool Node::setLocalScale(int64 time, Vec3 const& scale) { return writeAt(m_scale, time, rawValues(scale)); }

bool Node::setWSScale(int64 time, Vec3 const& scale) {
  return setLocalScale(time, quotients(scale, parentWorld(time).scale));
}

bool Node::setConstLocalPos(Vec3 const& position) {
  return m_translation->setConstValue(position, true, false);
}

bool Node::setConstWSPos(Vec3 const& position) {
  return setConstLocalPos(translationFor(positionRelativeTo(constParentWorld(), position)));
}

void Node::setConstLocalRot(TalixRotation const& rotation, bool withoutPre) {
  m_rotation->setConstValue(withoutPre ? rotation : m_preRotation.inverse() * rotation, true);
}

void Node::setConstWSRot(TalixRotation const& rotation) {
  setConstLocalRot(constParentWorld().rotation.inverse() * rotation, false);
}

bool Node::setConstLocalScale(Vec3 const& scale) { return m_scale->setConstValue(scale, true, false); }

bool Node::setConstWSScale(Vec3 const& scale) {
  return setConstLocalScale(quotients(scale, constParentWorld().scale));
}

struct Node::PreTransformChange : UndoChange {
  explicit PreTransformChange(Node& concerned)
      : UndoChange(&concerned),
        node(concerned),
        translation(concerned.m_preTranslation),
        rotation(concerned.m_preRotation) {}
  void swap() override {
    std::swap(translation, node.m_preTranslation);
    std::swap(rotation, node.m_preRotation);
  }
  bool isVoid() const override {
    return translation == node.m_preTranslation && rotation == node.m_preRotation;
  }
  int64 memoryUse() const override { return sizeof *this; }

  void tell(ChangeSetBuilder& changes) const override {
    constexpr auto kind = SceneChange::Kind::attribute;
    changes.tell(kind, &node, "PreTranslation", textOf(translation), textOf(node.m_preTranslation));
    changes.tell(kind, &node, "PreRotation", textOf(rotation), textOf(node.m_preRotation));
  }

  Node& node;
  Vec3 translation;
  TalixRotation rotation;
};

void Node::storePreTransform(Vec3 const& translation, TalixRotation const& rotation) {
  if (isRecorded()) journal().addOnce<PreTransformChange>(m_preTransformMark, *this);
  m_preTranslation = translation;
  m_preRotation = rotation;
  markMoved(this);
}

bool Node::setPreRotation(TalixRotation const& rotation, bool keepWorld) {
  TalixRotation const former = getConstLocalRot(false);
  storePreTransform(m_preTranslation, rotation);
  if (keepWorld) setConstLocalRot(former, false);
  return true;
}

bool Node::setPreTranslation(Vec3 const& translation) {
  if (!isFinite(translation)) return false;
  storePreTransform(translation, m_preRotation);
  return true;
}

void Node::setPreRotationWS(TalixRotation const& rotation) {
  setPreRotation(parentWorld(now(*this)).rotation.inverse() * rotation, false);
}

bool Node::setPreTranslationWS(Vec3 const& translation) {
  return setPreTranslation(positionRelativeTo(parentWorld(now(*this)), translation));
}
