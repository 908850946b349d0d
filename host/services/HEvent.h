// Events tell views and other listeners of changes. Submitting is safe from any thread; events are delivered
// on the main thread, in the order in which they were submitted.
#pragma once

#include <deque>
#include <functional>
#include <memory>
#include <typeindex>
#include <unordered_set>
#include <vector>

#include "host/services/HCriticalSection.h"

class HEvent {
 public:
  virtual ~HEvent() = default;
  virtual std::unique_ptr<HEvent> clone() const = 0;
  // Whether it may join the queue while another event of its class waits there.
  virtual bool mayJoinAnother() const { return true; }
};

// The classes of which an event waits in the queue.
struct HSmartEventStaticDataStore {
  HCriticalSection section;
  std::unordered_set<std::type_index> pending;
};

class HSmartEvent : public HEvent {
 public:
  static HSmartEventStaticDataStore s_staticData;
};

// Of each class that derives from this one at most one event is queued; later ones are dropped until it is
// delivered.
class HDontSubmitIfAnotherQueuedEvent : public HSmartEvent {
 public:
  bool mayJoinAnother() const override { return false; }
};

class HEventManager {
 public:
  using Listener = std::function<void(HEvent const&)>;

  // Queues a copy of the event.
  static void safeSubmit(HEvent const& event);
  // Delivers the event at once; main thread only. Answers whether anyone listens.
  bool submitImmediate(HEvent const& event);
  // Delivers what is queued, also what listeners submit meanwhile; main thread only.
  void deliverQueued();

  // Answers a number to stop listening with.
  int addListener(Listener listener);
  void removeListener(int number);

 private:
  HCriticalSection m_section;  // guards the queue
  std::deque<std::unique_ptr<HEvent>> m_queue;
  std::vector<std::pair<int, Listener>> m_listeners;
  int m_lastNumber = 0;
};

extern HEventManager* g_eventManager;
