#include "commands/keys/KeyClipboard.h"

#include "host/scene/Database.h"
#include "host/scene/PropertyTable.h"

bool nameOneChannel() {
  auto const channelId = [](int i) { return g_db->getActiveProperty(i) & ~PropertyTable::kWhole; };
  for (int i = 1; i < g_db->getNumActiveProperties(); ++i)
    if (channelId(i) != channelId(0)) return false;
  return true;
}

Controller* activeChannel() {
  Module const* module = g_db->getPrimarySelectedModule();
  return module ? module->getProperty(g_db->getActiveProperty(0)) : nullptr;
}

ClipboardManager::ControllerDataType clipboardTypeOf(Controller const* channel) {
  if (objectAs<FloatController>(channel)) return ClipboardManager::FloatKeys;
  if (objectAs<Vec3Controller>(channel)) return ClipboardManager::Vec3Keys;
  if (objectAs<RotController>(channel)) return ClipboardManager::RotKeys;
  if (objectAs<BoolController>(channel)) return ClipboardManager::BoolKeys;
  return ClipboardManager::OtherKeys;
}
