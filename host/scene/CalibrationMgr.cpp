#include "host/scene/CalibrationMgr.h"

#include <algorithm>
#include <vector>

#include "host/scene/Database.h"
#include "host/scene/Devices.h"

uint32 CalibrationMgr::getNextAvailableDeviceID() const {
  std::vector<int> taken;
  for (Module* camera : g_db->getModulesOfType(&OpticalCamera::s_classOpticalCamera))
    taken.push_back(static_cast<OpticalCamera*>(camera)->getDeviceID());
  std::sort(taken.begin(), taken.end());
  int next = 1;
  for (const int id : taken)
    if (id == next) ++next;
  return static_cast<uint32>(next);
}

void CalibrationMgr::addToSystemGroup(Module* module) {
  TSimpleArray<Module*> groups = g_db->getModulesOfType(&SystemGroup::s_classSystemGroup);
  Module* group =
      groups.getCount() ? groups[0] : g_db->createModule(&SystemGroup::s_classSystemGroup, "System", nullptr);
  if (group) group->addChild(module);
}
