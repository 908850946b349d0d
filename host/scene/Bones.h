// Bones of a skeleton. A bone turns about its major axis and swings about its minor axis; its DOFs say which
// components move.
#pragma once

#include "host/scene/Node.h"

class BaseBone : public Node {
  H_DECLARE_CLASS(BaseBone, Node)

 public:
  // 0 x, 1 y, 2 z.
  int getMajorAxisIndex() const { return m_majorAxis->getIndex(); }
  int getMinorAxisIndex() const { return m_minorAxis->getIndex(); }
  int getNumDofs() const override;
  BitFieldAttribute* getDofs() const { return m_dofs; }

 protected:
  void setUp() override;

 private:
  EnumAttribute* m_majorAxis = nullptr;
  EnumAttribute* m_minorAxis = nullptr;
  BitFieldAttribute* m_dofs = nullptr;
};

class LabelingBone : public BaseBone {
  H_DECLARE_CLASS(LabelingBone, BaseBone)

 private:
  friend class Selection;
  uint32 m_selectedLabelingBoneSlot = kNoSlot;
};

class SolvingBone : public BaseBone {
  H_DECLARE_CLASS(SolvingBone, BaseBone)
};
