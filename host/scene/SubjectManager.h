// The characters of a scene and those selected.
#pragma once

#include "host/scene/Character.h"

class SubjectManager {
 public:
  explicit SubjectManager(Database& scene) : m_scene(scene) {}

  uint64 getNumSubjects() const { return static_cast<uint64>(m_subjects.getCount()); }
  Character* getSubject(uint64 i) const { return m_subjects.at(static_cast<int64>(i)); }
  Character* getSubject(HString const& name) const;  // the first created of that name
  uint64 getNumSelectedSubjects() const;
  Character* getSelectedSubject(uint64 i) const;

  // Takes a character out of the scene with all below it but the markers, which become unlabeled roots and
  // move in the world as before (MotionKeeper.h). removeLabels: they are named as markers without a label
  // are, "unlabeled", "unlabeled_1" and so on; else they keep their names, with the character's in front as a
  // namespace, even where such a name is taken. undoable, notify: as for removeFromScene. False when the
  // character is not in the scene.
  bool removeSubject(Character* subject, bool removeLabels, bool undoable, bool notify);
  void removeAllSubjects(bool removeLabels, bool undoable, bool notify);

 private:
  friend class Database;
  Database& m_scene;
  OrderedList<Character, &Character::m_subjectSlot> m_subjects;
};
