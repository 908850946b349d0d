#include <algorithm>
#include <sstream>

#include "host/scene/Bones.h"
#include "io/bvh/BvhChannels.h"
#include "io/scene/FileMetadata.h"
#include "io/scene/TakeExportParts.h"
#include "io/scene/UpAxisConversion.h"

namespace talix {

namespace {

bool isBone(Module const* module) { return module->isKindOf(&BaseBone::staticClass()); }
bool isPlainNode(Module const* module) { return module->getRuntimeClass() == &Node::staticClass(); }

bool hasBoneBelow(Module const* module) {
  for (int i = 0; i < module->getNumChildren(); ++i) {
    Module const* child = module->getChild(i);
    if (isBone(child) || (isPlainNode(child) && hasBoneBelow(child))) return true;
  }
  return false;
}

// Bones, and plain nodes that tie bones together or end a chain of them.
bool isJointBelow(Module const* module, bool parentIsJoint) {
  return isBone(module) || (isPlainNode(module) && (parentIsJoint || hasBoneBelow(module)));
}

class JointExport {
 public:
  explicit JointExport(TakeExport& out) : m_out(out), m_sampler(*out.sampler), m_world(out.sampler) {}

  void addSkeleton(Node const& root) {
    std::vector<Node const*> nodes;
    std::vector<int> parents;
    collect(root, -1, nodes, parents);
    if (std::none_of(nodes.begin(), nodes.end(), [&](Node const* node) { return isInTake(*node); })) return;
    int const first = static_cast<int>(m_out.take.joints.size());
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
  static void collect(Node const& node, int parent, std::vector<Node const*>& nodes,
                      std::vector<int>& parents) {
    int const index = static_cast<int>(nodes.size());
    nodes.push_back(&node);
    parents.push_back(parent);
    for (int i = 0; i < node.getNumNodeChildren(); ++i) {
      Node const* child = node.getNodeChild(i);
      if (isJointBelow(child, true)) collect(*child, index, nodes, parents);
    }
  }

  bool isInTake(Node const& node) const {
    return isBone(&node) && m_sampler.belongsToClip(*node.getTranslationChannel()) &&
           m_sampler.belongsToClip(*node.getRotationChannel());
  }

  JointSource joint(Node const& node, int parent, bool isLast) {
    JointSource result;
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

  void setBelowParent(JointSource& result, Node const& node) const {
    Vec3 const offset = node.getPreTranslation();
    TalixRotation const before = node.getPreRotation();
    bool const turns = !isNoRotation(before);
    result.offset = offset;
    Controller const& translation = *node.getTranslationChannel();
    if (m_sampler.mayChange(translation) || !(node.getConstLocalPos() == Vec3())) {
      if (result.endSite) {
        result.offset = offset + before.rotate(node.getConstLocalPos());
        return;
      }
      result.translations = channelSource(m_out.sampler, translation, {}, [=](double* values) {
        Vec3 const moved(values);
        (offset + (turns ? before.rotate(moved) : moved)).getValue(values);
      });
    }
    Controller const& rotation = *node.getRotationChannel();
    if (result.endSite ||
        (!m_sampler.mayChange(rotation) && !turns && isNoRotation(node.getConstLocalRot(true))))
      return;
    result.rotations = channelSource(m_out.sampler, rotation, {}, [=](double* values) {
      if (!turns) return;
      TalixRotation own;
      own.setQuaternion(values);
      (before * own).getQuaternion(values);
    });
  }

  // A root joint below something that is not simply the world: where it is in the world, frame by frame.
  void setInWorld(JointSource& result, Node const& node) {
    result.offset = node.getPreTranslationInSpaceOfNode(nullptr);
    result.translations = m_world.positions(node, nullptr);
    result.rotations = m_world.rotations(node);
  }

  // The file's channels, as long as they are what the joint needs.
  std::vector<std::string> channels(JointSource const& result, Node const& node) const {
    std::istringstream words(fileMetadata::text(node, fileMetadata::kFileChannels));
    std::vector<std::string> names;
    std::vector<BvhChannel> known;
    for (std::string word; words >> word; names.push_back(word)) {
      auto const channel = bvhChannel(word);
      if (!channel) return {};
      known.push_back(*channel);
    }
    std::vector<int> const axes = rotationAxes(known);
    bool const moves = axes.size() < known.size();
    if (!moves && result.translations) return {};
    if (axes.empty() ? result.rotations != nullptr : rotationOrderOf(axes) != result.rotationOrder) return {};
    return names;
  }

  TakeExport& m_out;
  FrameSampler const& m_sampler;
  WorldSources m_world;
  int64 m_scaled = 0;
};

}  // namespace

void exportJoints(TakeExport& out) {
  JointExport joints(out);
  for (int i = 0; i < out.scene.getNumNodes(); ++i) {
    Node const* node = out.scene.getNode(i);
    Node const* parent = node->getNodeParent();
    if (!isJointBelow(node, false)) continue;
    if (!parent || !isJointBelow(parent, false)) joints.addSkeleton(*node);
  }
  joints.addNotes();
}

}  // namespace talix
