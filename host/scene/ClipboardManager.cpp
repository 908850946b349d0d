#include "host/scene/ClipboardManager.h"

void ClipboardManager::startClipboardCopy(ClipboardDataType, ControllerDataType type,
                                          TalixRotation::RotOrder order) {
  m_incoming.clear();
  m_incomingType = type;
  m_incomingOrder = order;
}

void ClipboardManager::finishClipboardCopy(bool keep) {
  if (keep) {
    m_keys = std::make_shared<std::vector<tagKey> const>(std::move(m_incoming));
    m_type = m_incomingType;
    m_order = m_incomingOrder;
    m_filled = true;
  }
  m_incoming.clear();
}

HTimeRange ClipboardManager::getControllerDataRange() const {
  HTimeRange range;
  for (int i = 0; i < getNumControllerKeys(); ++i) range.include(getControllerKey(i).time);
  return range;
}
