#include "host/scene/CalibrationMgr.h"

#include "host/scene/Database.h"
#include "host/scene/Devices.h"
#include "host/scene/SceneIndex.h"

FreeDeviceNumbers::FreeDeviceNumbers(Database const& scene) {
  for (Module* camera : scene.getModulesOfType(&OpticalCamera::s_classOpticalCamera))
    m_taken.insert(static_cast<uint32>(static_cast<OpticalCamera*>(camera)->getDeviceID()));
}

uint32 FreeDeviceNumbers::take() {
  while (m_taken.contains(m_next)) ++m_next;
  return m_next++;
}

uint32 CalibrationMgr::getNextAvailableDeviceID() const { return FreeDeviceNumbers(m_scene).take(); }

Module* CalibrationMgr::findSystemGroup() {
  Module* group = m_scene.getModule(m_systemGroup);
  if (group || !m_scene.moduleOfTypeExists(&SystemGroup::s_classSystemGroup)) return group;
  group = m_scene.getModulesOfType(&SystemGroup::s_classSystemGroup)[0];
  m_systemGroup = group->getID();
  return group;
}

void CalibrationMgr::addToSystemGroup(Module* module) {
  Module* group = findSystemGroup();
  if (!group) group = m_scene.createModule(&SystemGroup::s_classSystemGroup, "System", nullptr);
  if (!group || module->getParent() == group) return;
  HString const name = m_scene.getIndex().freeName(group, module->getName());
  if (group->addChild(module)) module->setName(name);
}
