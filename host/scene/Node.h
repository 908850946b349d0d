// A module with a transform.
//
// Parent-space position = pre-translation + pre-rotation * translation; orientation = pre-rotation *
// rotation; scale as is. "Local" means the channel's own value. World space composes through the nearest node
// ancestors; a parent's scale moves its children, and world scale is the product by component. Lengths are
// millimetres, times ticks. "Const" operations use default values throughout.
#pragma once

#include "host/math/Transform.h"
#include "host/scene/ConnectingLines.h"
#include "host/scene/Module.h"

class Node : public Module {
  H_DECLARE_CLASS(Node, Module)

 public:
  ~Node() override;

  Vec3Controller* getTranslationChannel() const { return m_translation; }
  RotController* getRotationChannel() const { return m_rotation; }
  Vec3Controller* getScaleChannel() const { return m_scale; }
  // Marks the nodes at and below a module as moved, stopping where that is known already.
  static void markMoved(Module* module) noexcept;

  // The channel that key searches of a node look at: "Translation".
  Controller* getTransformChannel() const { return m_translation; }

  TalixRotation::RotOrder getRotationOrder() const;
  bool setRotationOrder(TalixRotation::RotOrder order);
  virtual int getNumDofs() const { return 0; }

  // --- reading ---
  Vec3 getLocalPos(int64 time) const;
  TalixRotation getLocalRot(int64 time) const;
  Vec3 getLocalScale(int64 time) const;
  Vec3 getWSPos(int64 time) const;
  TalixRotation getWSRot(int64 time) const;
  Vec3 getWSScale(int64 time) const;
  // As seen from another node; null is the world.
  Vec3 getPosInSpaceOfNode(int64 time, Node* space) const;
  TalixRotation getRotInSpaceOfNode(int64 time, Node* space) const;
  Vec3 getScaleInSpaceOfNode(int64 time, Node* space) const;
  Transform getWorldTransform(int64 time) const;

  Vec3 getConstLocalPos() const;
  // withoutPre: the channel's own default; else the pre-rotation before it.
  TalixRotation getConstLocalRot(bool withoutPre) const;
  Vec3 getConstLocalScale() const;
  Vec3 getConstWSPos() const;
  TalixRotation getConstWSRot() const;
  Vec3 getConstWSScale() const;
  Vec3 getConstPosInSpaceOfNode(Node const* space) const;
  TalixRotation getConstRotInSpaceOfNode(Node const* space) const;
  Vec3 getConstScaleInSpaceOfNode(Node const* space) const;

  // World and other spaces see the pre-transform at the current time.
  Vec3 getPreTranslation() const { return m_preTranslation; }
  TalixRotation getPreRotation() const { return m_preRotation; }
  Vec3 getPreTranslationWS() const;
  TalixRotation getPreRotationWS() const;
  Vec3 getPreTranslationInSpaceOfNode(Node* space) const;
  TalixRotation getPreRotationInSpaceOfNode(Node* space) const;

  // --- writing ---
  // Setters at a time write a key in the active clip, so that the sum of its layers is right; with no active
  // clip they write the default value; what is locked stays. World setters find the local value below the
  // present parent. Setters of default values and pre-transforms write where it is locked, too
  // (Editability.h). Positions and scales are written only when what is to be stored is finite, which a far
  // value below a small parent may not be; else the result is false.
  virtual bool setLocalPos(int64 time, Vec3 const& position);
  virtual bool setWSPos(int64 time, Vec3 const& position);
  virtual void setLocalRot(int64 time, TalixRotation const& rotation);
  virtual void setWSRot(int64 time, TalixRotation const& rotation);
  virtual bool setLocalScale(int64 time, Vec3 const& scale);
  virtual bool setWSScale(int64 time, Vec3 const& scale);
  virtual bool setConstLocalPos(Vec3 const& position);
  virtual bool setConstWSPos(Vec3 const& position);
  virtual void setConstLocalRot(TalixRotation const& rotation, bool withoutPre);
  virtual void setConstWSRot(TalixRotation const& rotation);
  virtual bool setConstLocalScale(Vec3 const& scale);
  virtual bool setConstWSScale(Vec3 const& scale);

  // Re-expresses the motion within a range relative to `target` (null: the world) instead of the present node
  // parent, so that the node and all below it stay as they are in the world once it hangs there. The active
  // layer of the active clip is changed; with no active clip the default values are. Exact at every key time
  // of the node and its old and new ancestors; between them within 0.01 mm and 0.01 degrees at whole frames.
  // Pre-transforms stay. Frames at which a marker has no data get none; what lies outside the range stays as
  // it is relative to its parent. Along an axis that the target scales by 0 everything is at 0.
  // False when something could not be kept: the target lies below the node, a channel is not editable, or a
  // value would not be finite. The target and non-finite cases leave the node as it was.
  virtual bool parentAdjust(Node* target, HTimeRange const& range);

  // keepWorld: the default rotation turns so that the node stays as it is. Always returns true.
  bool setPreRotation(TalixRotation const& rotation, bool keepWorld);
  bool setPreTranslation(Vec3 const& translation);
  void setPreRotationWS(TalixRotation const& rotation);
  bool setPreTranslationWS(Vec3 const& translation);

  // --- connecting lines ---
  bool isConnectedTo(Node const* target) const { return m_lines.leadTo(target); }
  int getNumConnectingLines() const { return m_lines.getCount(); }
  MarkerConnection getConnectingLine(int i) const { return m_lines.at(i); }
  // For reading: a line with another colour is added in place of the former one.
  MarkerConnection* getConnectionTo(Node const* target) { return m_lines.find(target); }
  // Replaces a line to the same target. One to a node of another scene is not taken.
  void addConnectingLine(MarkerConnection const& line) {
    if (line.getTarget() && line.getTarget()->getDatabase() == getDatabase())
      m_lines.store(line.getTarget(), &line);
  }
  void removeConnectingLine(MarkerConnection const& line) { removeConnectingLine(line.getTarget()); }
  void removeConnectingLine(Node* target) { m_lines.store(target, nullptr); }
  void resetAllLines() {
    while (m_lines.getCount() > 0) m_lines.store(m_lines.at(0).getTarget(), nullptr);
  }

 protected:
  Node() = default;
  void setUp() override;
  void dataChanged(Controller const* channel) override;

 private:
  friend class Database;
  friend class Selection;

  void storePreTransform(Vec3 const& translation, TalixRotation const& rotation);  // mutator
  struct PreTransformChange;
  // Caches this node's world transform; the parent's (null: none) holds already.
  Transform const& cacheBelow(Node const* parent, int64 time) const;
  // In the space of the parent node.
  Transform inParent(int64 time) const;
  Transform constInParent() const;
  Transform constWorld() const;
  // Of the parent node; the world itself without one.
  Transform parentWorld(int64 time) const;
  Transform constParentWorld() const;
  Vec3 translationFor(Vec3 const& inParent) const;
  // False, with nothing written, when the channel cannot hold the values.
  bool writeAt(Controller* channel, int64 time, Controller::Values const& values);

  Vec3Controller* m_translation = nullptr;
  RotController* m_rotation = nullptr;
  Vec3Controller* m_scale = nullptr;
  EnumAttribute* m_rotationOrder = nullptr;
  Vec3 m_preTranslation;
  TalixRotation m_preRotation;
  ConnectingLines m_lines{*this};

  uint64 m_preTransformMark = 0;  // of undo steps

  mutable Transform m_world;        // at the cache's time
  mutable uint64 m_worldEpoch = 0;  // of the cache; m_world holds when they are equal
  uint32 m_nodeSlot = kNoSlot;
  uint32 m_selectedNodeSlot = kNoSlot;
};

// The order in which a module's angles are counted; XYZ for one that is no node.
inline TalixRotation::RotOrder rotationOrderOf(Module const& module) {
  Node const* node = objectAs<Node>(&module);
  return node ? node->getRotationOrder() : TalixRotation::XYZ;
}
