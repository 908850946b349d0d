#include <algorithm>
#include <sstream>

#include "host/scene/Bones.h"
#include "io/bvh/BvhChannels.h"
#include "io/scene/FileMetadata.h"
#include "io/scene/TakeExportParts.h"
#include "io/scene/UpAxisConversion.h"

namespace talix {

namespace {

bool isBone(const Module* module) { return module->isKindOf(&BaseBone::staticClass()); }
bool isPlainNode(const Module* module) { return module->getRuntimeClass() == &Node::staticClass(); }

bool hasBoneBelow(const Module* module) {
  for (int i = 0; i < module->getNumChildren(); ++i) {
    const Module* child = module->getChild(i);
    if (isBone(child) || (isPlainNode(child) && hasBoneBelow(child))) return true;
  }
  return false;
}

// Bones, and plain nodes that tie bones together or end a chain of them.
bool isJointBelow(const Module* module, bool parentIsJoint) {
  return isBone(module) || (isPlainNode(module) && (parentIsJoint || hasBoneBelow(module)));
}

class JointExport {
 public:
  explicit JointExport(TakeExport& out) : m_out(out), m_sampler(out.sampler) {}

  void addSkeleton(const Node& root) {
    std::vector<const Node*> nodes;
    std::vector<int> parents;
    collect(root, -1, nodes, parents);
    if (std::none_of(nodes.begin(), nodes.end(), [&](const Node* node) { return isInTake(*node); })) return;
    const int first = static_cast<int>(m_out.take.joints.size());
    for (size_t i = 0; i < nodes.size(); ++i)
      m_out.take.joints.push_back(
          joint(*nodes[i], parents[i] < 0 ? -1 : first + parents[i],
                std::find(parents.begin(), parents.end(), static_cast<int>(i)) == parents.end()));
  }

  void addNotes() {
    if (m_scaled)
      m_out.warn("takes hold no scale of joints; that of " + std::to_string(m_scaled) +
                 (m_scaled == 1 ? " joint" : " joints") + " was left out");
  }

 private:
  // Depth first, siblings in order, parents by index into `nodes`.
  static void collect(const Node& node, int parent, std::vector<const Node*>& nodes,
                      std::vector<int>& parents) {
    const int index = static_cast<int>(nodes.size());
    nodes.push_back(&node);
    parents.push_back(parent);
    for (int i = 0; i < node.getNumNodeChildren(); ++i) {
      const Node* child = node.getNodeChild(i);
      if (isJointBelow(child, true)) collect(*child, index, nodes, parents);
    }
  }

  bool isInTake(const Node& node) const {
    return isBone(&node) && m_sampler.belongsToClip(*node.getTranslationChannel()) &&
           m_sampler.belongsToClip(*node.getRotationChannel());
  }

  TakeJoint joint(const Node& node, int parent, bool isLast) {
    TakeJoint result;
    result.name = node.getName().GetString();
    result.parent = parent;
    result.endSite = isPlainNode(&node) && parent >= 0 && isLast &&
                     !m_sampler.mayChange(*node.getTranslationChannel()) &&
                     !m_sampler.mayChange(*node.getRotationChannel());
    result.rotationOrder = node.getRotationOrder();
    m_out.keysLeftOut += m_sampler.keysOffGrid(*node.getTranslationChannel()) +
                         m_sampler.keysOffGrid(*node.getRotationChannel());
    m_scaled += m_sampler.mayChange(*node.getScaleChannel()) || !(node.getConstLocalScale() == Vec3(1, 1, 1));
    if (parent < 0 && !isWorldSpace(m_sampler, node.getNodeParent()))
      setInWorld(result, node);
    else
      setBelowParent(result, node);
    if (!result.endSite) result.channels = channels(result, node);
    return result;
  }

  void setBelowParent(TakeJoint& result, const Node& node) const {
    const Vec3 offset = node.getPreTranslation();
    const TalixRotation before = node.getPreRotation();
    const bool turns = !isNoRotation(before);
    result.offset = offset;
    const Controller& translation = *node.getTranslationChannel();
    if (m_sampler.mayChange(translation) || !(node.getConstLocalPos() == Vec3())) {
      if (result.endSite) {
        result.offset = offset + before.rotate(node.getConstLocalPos());
        return;
      }
      result.translations = m_sampler.everyFrame(translation);
      if (turns || !(offset == Vec3()))
        result.translations.transform([&](double* values) {
          const Vec3 moved(values);
          (offset + (turns ? before.rotate(moved) : moved)).getValue(values);
        });
    }
    const Controller& rotation = *node.getRotationChannel();
    if (result.endSite ||
        (!m_sampler.mayChange(rotation) && !turns && isNoRotation(node.getConstLocalRot(true))))
      return;
    result.rotations = m_sampler.everyFrame(rotation);
    if (turns)
      result.rotations.transform([&](double* values) {
        TalixRotation own;
        own.setQuaternion(values);
        (before * own).getQuaternion(values);
      });
  }

  // A root joint below something that is not simply the world: where it is in the world, frame by frame.
  void setInWorld(TakeJoint& result, const Node& node) const {
    const FrameGrid& grid = m_sampler.grid();
    FrameRun positions(KeyTrack::Shape::Vector, grid), rotations(KeyTrack::Shape::Rotation, grid);
    for (int64 i = 0; i < grid.count; ++i) {
      const int64 time = grid.start() + i * grid.period;
      const Transform world = node.getWorldTransform(time);
      double quaternion[4];
      world.rotation.getQuaternion(quaternion);
      positions.add(i, &world.position.x);
      rotations.add(i, quaternion);
    }
    result.offset = node.getPreTranslationInSpaceOfNode(nullptr);
    result.translations = positions.take();
    result.rotations = rotations.take();
  }

  // The file's channels, as long as they are what the joint needs.
  std::vector<std::string> channels(const TakeJoint& result, const Node& node) const {
    std::istringstream words(fileMetadata::text(node, fileMetadata::kFileChannels));
    std::vector<std::string> names;
    std::vector<BvhChannel> known;
    for (std::string word; words >> word; names.push_back(word)) {
      const auto channel = bvhChannel(word);
      if (!channel) return {};
      known.push_back(*channel);
    }
    const std::vector<int> axes = rotationAxes(known);
    const bool moves = axes.size() < known.size();
    if (!moves && !result.translations.empty()) return {};
    if (axes.empty() ? !result.rotations.empty() : rotationOrderOf(axes) != result.rotationOrder) return {};
    return names;
  }

  TakeExport& m_out;
  const FrameSampler& m_sampler;
  int64 m_scaled = 0;
};

}  // namespace

void exportJoints(TakeExport& out) {
  JointExport joints(out);
  for (int i = 0; i < out.scene.getNumNodes(); ++i) {
    const Node* node = out.scene.getNode(i);
    const Node* parent = node->getNodeParent();
    if (!isJointBelow(node, false)) continue;
    if (!parent || !isJointBelow(parent, false)) joints.addSkeleton(*node);
  }
  joints.addNotes();
}

}  // namespace talix
