#include "commands/markers/BoneVirtuals.h"

#include <cmath>

#include "host/command/Command.h"
#include "host/scene/Character.h"
#include "host/scene/Constraints.h"
#include "host/scene/DataEdit.h"
#include "host/scene/Database.h"
#include "host/scene/Editability.h"
#include "host/scene/HTimeManager.h"
#include "host/scene/Setups.h"
#include "host/scene/motion/FollowingKeys.h"

namespace {

constexpr double kShortest = 0.001;  // millimetres; of a bone
constexpr double kSideways = 0.25;   // of the bone's length

// Across the bone. The axis beside the longest component of the child's place gives the direction.
Vec3 sideways(Vec3 const& child) {
  double const x = std::abs(child.x), y = std::abs(child.y), z = std::abs(child.z);
  double const length = kSideways * child.length();
  Vec3 const helper = x > y && x > z ? Vec3(0, length, 0) : y > z ? Vec3(0, 0, length) : Vec3(length, 0, 0);
  Vec3 across = child.cross(helper);
  across.setLength(length);
  return across;
}

class BoneVirtuals {
 public:
  BoneVirtuals(SolvingBone& bone, std::vector<Marker*>& created)
      : m_bone(bone),
        m_character(bone.getCharacterParent()),
        m_setup(m_character ? m_character->getSolvingSetup(true) : nullptr),
        m_created(created) {}

  bool make(bool withJoint) {
    Vec3 child, across;
    for (int i = 0; i < m_bone.getNumNodeChildren(); ++i) {
      Node* node = m_bone.getNodeChild(i);
      if (!node->isKindOf(&SolvingBone::s_classSolvingBone)) continue;
      Vec3 const place = node->getPosInSpaceOfNode(HTimeManager::getInstance()->getTime(), &m_bone);
      if (place.length() < kShortest) continue;
      child = place;
      across = sideways(place);
    }
    bool const pair = !(child == Vec3());
    if (!isFree(withJoint, pair)) return false;
    if (pair) {
      tie("_virtA", child + across);
      tie("_virtB", child - across);
    }
    if (withJoint) tie("_virt", Vec3());
    return pair || withJoint;
  }

 private:
  bool isFree(bool withJoint, bool pair) const {
    int const taken = pair ? isTaken("_virtA") + isTaken("_virtB") : 0;
    if (taken)
      Command::logError(taken == 1 ? "Cannot create bone virtual marker"
                                   : "Cannot create bone virtual markers");
    else if (withJoint && isTaken("_virt"))
      Command::logError("Cannot create joint bone virtual markers");
    else
      return true;
    return false;
  }

  HString nameOf(char const* suffix) const { return m_bone.getName() + suffix; }

  // What stands under a marker's name: below the character, or its solving setup.
  Module* find(char const* suffix) const {
    HString const name = HString("\\") + nameOf(suffix);
    for (Module const* parent :
         {static_cast<Module const*>(m_character), static_cast<Module const*>(m_setup)}) {
      HString const path = (parent ? parent->getFullPathString() : HString()) + name;
      if (Module* module = g_db->getModuleWithPath(path, nullptr, false)) return module;
    }
    return nullptr;
  }
  int isTaken(char const* suffix) const {
    Module const* module = find(suffix);
    return module && !module->isKindOf(&Marker::s_classMarker) ? 1 : 0;
  }

  void tie(char const* suffix, Vec3 const& offset) {
    auto* marker = static_cast<Marker*>(find(suffix));
    if (!marker) {
      marker = Marker::createInstance();
      marker->setName(nameOf(suffix));
      g_db->addToScene(marker, false, m_character, false, true);
      m_created.push_back(marker);
    }
    auto* constraint = static_cast<SolvingConstraint*>(g_db->createModule(
        &SolvingConstraint::staticClass(), (nameOf(suffix) + "_constraint").GetStr(), m_setup));
    constraint->setSource(marker);
    constraint->setTarget(&m_bone);
    constraint->setConstraintOffset(offset);
    key(*marker, *constraint);
  }

  void key(Marker& marker, SolvingConstraint const& constraint) const {
    Vec3Controller& channel = *marker.getTranslationChannel();
    HTimeRange const range = HTimeManager::getInstance()->getAnimRange();
    marker.setConstWSPos(constraint.getConstraintOffsetWS(range.getStart()));
    NLEClip* clip = g_db->getActiveClip();
    if (!clip || !clip->holdsKeys() || range.isEmpty()) return;
    if (Obstacle const obstacle = obstacleToKeys(channel, clip, 0); obstacle != Obstacle::none) {
      Command::logWarning("%s was not keyed: %s", marker.getName().GetStr(), reasonOf(obstacle));
      return;
    }
    DataEdit const edit(channel);
    channel.setInterpType(static_cast<int>(Interpolation::Linear));
    channel.setTrack(clip, 0, followingKeys(marker, m_bone, constraint.getConstraintOffset(), *clip, range));
  }

  SolvingBone& m_bone;
  Character* m_character;
  SolvingSetup* m_setup;
  std::vector<Marker*>& m_created;
};

}  // namespace

bool makeBoneVirtuals(SolvingBone& bone, bool withJoint, std::vector<Marker*>& created) {
  return BoneVirtuals(bone, created).make(withJoint);
}
