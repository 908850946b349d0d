#include "host/scene/SubjectManager.h"

#include "host/scene/Database.h"

Character* SubjectManager::getSubject(HString const& name) const {
  for (int i = 0; i < m_subjects.getCount(); ++i)
    if (m_subjects.at(i)->getName() == name) return m_subjects.at(i);
  return nullptr;
}

uint64 SubjectManager::getNumSelectedSubjects() const {
  return static_cast<uint64>(g_db->getSelection().getNumCharacters());
}

Character* SubjectManager::getSelectedSubject(uint64 i) const {
  return g_db->getSelection().getCharacter(static_cast<int>(i));
}
