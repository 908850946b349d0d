#include "io/scene/FileMetadata.h"
#include "io/scene/TakeImportParts.h"

namespace talix {

namespace {

// Offsets that differ by less are the same, in mm.
constexpr double kSameOffset = 1e-6;

bool isBone(Module const& module) { return module.isKindOf(&BaseBone::staticClass()); }
bool isPlainNode(Module const& module) { return module.getRuntimeClass() == &Node::staticClass(); }

// "Xposition" is Tx, "Zrotation" Rz: the label of the degree of freedom that a channel moves.
HString dofLabel(std::string const& channel) {
  char const axis = channel.empty() ? ' ' : static_cast<char>(channel[0] | 0x20);
  bool const isRotation = channel.size() > 1 && (channel[1] | 0x20) == 'r';
  return std::string(1, isRotation ? 'R' : 'T') + axis;
}

void setDofs(BaseBone& bone, std::vector<std::string> const& channels) {
  BitFieldAttribute* dofs = bone.getDofs();
  for (int i = 0; i < dofs->getNumFields(); ++i)
    dofs->setValue(dofs->getLabel(i), false, true, true, true, true);
  for (std::string const& channel : channels) dofs->setValue(dofLabel(channel), true, true, true, true, true);
}

std::string joined(std::vector<std::string> const& words) {
  std::string text;
  for (std::string const& word : words) text += (text.empty() ? "" : " ") + word;
  return text;
}

class JointImport {
 public:
  JointImport(TakeImport& import, Take& take)
      : m_import(import),
        m_take(take),
        m_character(import.fileCharacter(take.name)),
        m_toCharacter(import.turn(), m_character) {}

  void run() {
    m_nodes.reserve(m_take.joints.size());
    for (TakeJoint& joint : m_take.joints) m_nodes.push_back(add(joint));
    if (m_mended) m_import.info(counted(m_mended, "joint name") + " held a backslash, which became \"_\"");
    if (m_otherOffsets == 0) return;
    m_import.warn((m_otherOffsets == 1 ? "the offset of \"" + m_firstOther + "\" differs"
                                       : "the offsets of " + std::to_string(m_otherOffsets) +
                                             " joints differ, such as \"" + m_firstOther + "\",") +
                  " from the scene's; the scene's skeleton was kept");
  }

 private:
  Node* add(TakeJoint& joint) {
    bool const isRoot = joint.parent < 0;
    Node* parent = isRoot ? m_character : m_nodes[static_cast<size_t>(joint.parent)];
    std::string const name = moduleName(joint.name);
    m_mended += name != joint.name;
    bool isNew = false;
    Node* node = joint.endSite ? m_import.place<Node>(isPlainNode, name, parent, &isNew)
                               : m_import.place<SolvingBone>(isBone, name, parent, &isNew);
    bool const turned = isRoot && !m_toCharacter.isIdentity();
    Vec3 const offset = turned ? m_toCharacter.position(joint.offset) : joint.offset;
    if (isNew)
      setUp(*node, joint, offset, turned);
    else
      compareOffset(*node, offset);
    if (!joint.endSite) addMotion(*node, joint, turned);
    return node;
  }

  void setUp(Node& node, TakeJoint const& joint, Vec3 const& offset, bool turned) {
    node.setPreTranslation(offset);
    if (turned) node.setPreRotation(m_toCharacter.rotation(), false);
    if (joint.endSite) return;
    node.setRotationOrder(static_cast<TalixRotation::RotOrder>(joint.rotationOrder));
    setDofs(static_cast<BaseBone&>(node), joint.channels);
    if (!joint.channels.empty())
      fileMetadata::setText(node, fileMetadata::kFileChannels, joined(joint.channels));
  }

  void compareOffset(Node const& node, Vec3 const& offset) {
    if ((node.getPreTranslation() - offset).length() <= kSameOffset) return;
    if (m_otherOffsets++ == 0) m_firstOther = node.getName().GetString();
  }

  // A joint's position and orientation below its parent are the file's; the keys hold what the scene's
  // pre-transform leaves of them.
  void addMotion(Node& node, TakeJoint& joint, bool turned) {
    TalixRotation const unturn = node.getPreRotation().inverse();
    TalixRotation const before = turned ? unturn * m_toCharacter.rotation() : unturn;
    takeOffOffset(node, joint, turned, unturn, isNoRotation(before));
    if (!isNoRotation(before))
      joint.rotations.transform([&](double* values) {
        TalixRotation rotation;
        rotation.setQuaternion(values);
        (before * rotation).getQuaternion(values);
      });
    NLEClip* clip = &m_import.clip();
    if (!joint.translations.empty())
      node.getTranslationChannel()->setTrack(clip, 0, std::move(joint.translations));
    // A joint that never turns has a track as well: so it is known to belong to the clip.
    node.getRotationChannel()->setTrack(clip, 0, std::move(joint.rotations));
  }

  void takeOffOffset(Node const& node, TakeJoint& joint, bool turned, TalixRotation const& unturn,
                     bool sameTurn) {
    Vec3 const offset = node.getPreTranslation();
    if (!turned && offset == Vec3() && isNoRotation(unturn)) return;
    // Where the pre-transform is the file's, turned, the file's own offset comes off without rounding.
    bool const inFile = sameTurn && !m_toCharacter.isScaled() &&
                        offset == (turned ? m_toCharacter.position(joint.offset) : joint.offset);
    joint.translations.transform([&](double* values) {
      Vec3 place(values);
      if (inFile)
        place -= joint.offset;
      else
        place = unturn.rotate((turned ? m_toCharacter.position(place) : place) - offset);
      place.getValue(values);
    });
  }

  TakeImport& m_import;
  Take& m_take;
  Character* m_character;
  FileToParent m_toCharacter;
  std::vector<Node*> m_nodes;  // by joint
  int64 m_otherOffsets = 0, m_mended = 0;
  std::string m_firstOther;
};

}  // namespace

void importJoints(TakeImport& import, Take& take) {
  if (!take.joints.empty()) JointImport(import, take).run();
}

}  // namespace talix
