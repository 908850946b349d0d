#include "host/scene/SubjectManager.h"

#include "host/scene/Database.h"
#include "host/scene/SceneIndex.h"
#include "host/scene/motion/MotionScope.h"

Character* SubjectManager::getSubject(HString const& name) const {
  for (int i = 0; i < m_subjects.getCount(); ++i)
    if (m_subjects.at(i)->getName() == name) return m_subjects.at(i);
  return nullptr;
}

uint64 SubjectManager::getNumSelectedSubjects() const {
  return static_cast<uint64>(m_scene.getSelection().getNumCharacters());
}

Character* SubjectManager::getSelectedSubject(uint64 i) const {
  return m_scene.getSelection().getCharacter(static_cast<int64>(i));
}

bool SubjectManager::removeSubject(Character* subject, bool removeLabels, bool undoable, bool notify) {
  if (!subject || !m_scene.contains(subject)) return false;
  TSimpleArray<Module*> all(64, 4096);
  subject->getModAndDecedents(all);
  std::vector<Marker*> markers;
  for (Module* module : all)
    if (auto* marker = objectAs<Marker>(module)) markers.push_back(marker);

  // They become roots, and go on moving in the world as before.
  MotionScope const motion(m_scene);
  for (Marker* marker : markers) marker->parentAdjust(nullptr, HTimeRange::forever());
  HString const name = subject->getName();
  for (Marker* marker : markers) {
    marker->getParent()->removeChild(marker, false);
    // A namespace that the marker has already, or a name that can be none, is not put in front.
    if (removeLabels)
      marker->setName(m_scene.getIndex().freeName(nullptr, "unlabeled"));
    else
      marker->addNamespace(name);
  }
  return m_scene.removeFromScene(subject, true, true, undoable, notify);
}

void SubjectManager::removeAllSubjects(bool removeLabels, bool undoable, bool notify) {
  for (Character* subject : m_subjects.toVector()) removeSubject(subject, removeLabels, undoable, notify);
}
