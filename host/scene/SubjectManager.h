// The characters of the scene and those selected.
#pragma once

#include "host/scene/Character.h"

class SubjectManager {
 public:
  uint64 getNumSubjects() const { return static_cast<uint64>(m_subjects.getCount()); }
  Character* getSubject(uint64 i) const { return m_subjects.at(static_cast<int>(i)); }
  Character* getSubject(HString const& name) const;  // the first created of that name
  uint64 getNumSelectedSubjects() const;
  Character* getSelectedSubject(uint64 i) const;

 private:
  friend class Database;
  OrderedList<Character, &Character::m_subjectSlot> m_subjects;
};
