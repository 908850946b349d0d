#include "host/services/HEvent.h"

#include <algorithm>
#include <typeinfo>

HSmartEventStaticDataStore HSmartEvent::s_staticData;

HEventManager::~HEventManager() {
  HLock lock(HSmartEvent::s_staticData.section);
  std::erase_if(HSmartEvent::s_staticData.pending, [this](auto const& entry) { return entry.first == this; });
}

void HEventManager::safeSubmit(HEvent const& event) { g_eventManager->submit(event); }

void HEventManager::submit(HEvent const& event) {
  if (!event.mayJoinAnother()) {
    HLock lock(HSmartEvent::s_staticData.section);
    auto& pending = HSmartEvent::s_staticData.pending;
    std::pair<HEventManager const*, std::type_index> const entry(this, typeid(event));
    if (std::find(pending.begin(), pending.end(), entry) != pending.end()) return;
    pending.push_back(entry);
  }
  HLock lock(m_section);
  m_queue.push_back(event.clone());
}

bool HEventManager::submitImmediate(HEvent const& event) {
  // A listener may add or remove listeners.
  auto const listeners = m_listeners;
  for (auto const& [number, listener] : listeners) listener(event);
  return !listeners.empty();
}

void HEventManager::deliverQueued() {
  while (true) {
    std::unique_ptr<HEvent> event;
    {
      HLock lock(m_section);
      if (m_queue.empty()) return;
      event = std::move(m_queue.front());
      m_queue.pop_front();
    }
    if (!event->mayJoinAnother()) {
      HLock lock(HSmartEvent::s_staticData.section);
      HEvent const& known = *event;
      std::erase(HSmartEvent::s_staticData.pending,
                 std::pair<HEventManager const*, std::type_index>(this, typeid(known)));
    }
    submitImmediate(*event);
  }
}

int HEventManager::addListener(Listener listener) {
  m_listeners.emplace_back(++m_lastNumber, std::move(listener));
  return m_lastNumber;
}

void HEventManager::removeListener(int number) {
  std::erase_if(m_listeners, [&](auto const& entry) { return entry.first == number; });
}
