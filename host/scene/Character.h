// A subject: the root above its markers, setups and skeleton.
#pragma once

#include "host/scene/Node.h"

class SolvingSetup;

class Character : public Node {
  H_DECLARE_CLASS(Character, Node)

 public:
  // The first solving setup among the children. create: one is made when there is none.
  SolvingSetup* getSolvingSetup(bool create);

 private:
  friend class Database;
  friend class Selection;
  friend class SubjectManager;

  uint32 m_subjectSlot = kNoSlot;
  uint32 m_selectedSubjectSlot = kNoSlot;
};
