// Events tell views and other listeners of changes. Each scene has an event manager. Submitting is safe from
// any thread; events are delivered on the scene's thread, in the order in which they were submitted.
#pragma once

#include <deque>
#include <functional>
#include <memory>
#include <typeindex>
#include <utility>
#include <vector>

#include "host/base/ThreadLocal.h"
#include "host/services/HCriticalSection.h"

class HEvent {
 public:
  virtual ~HEvent() = default;
  virtual std::unique_ptr<HEvent> clone() const = 0;
  // Whether it may join the queue while another event of its class waits there.
  virtual bool mayJoinAnother() const { return true; }
};

class HEventManager;

// The classes of which an event waits in a manager's queue: few, so that they are looked through.
struct HSmartEventStaticDataStore {
  HCriticalSection section;
  std::vector<std::pair<HEventManager const*, std::type_index>> pending;
};

class HSmartEvent : public HEvent {
 public:
  static HSmartEventStaticDataStore s_staticData;
};

// Of each class that derives from this one a manager queues at most one event; later ones are dropped until
// it is delivered.
class HDontSubmitIfAnotherQueuedEvent : public HSmartEvent {
 public:
  bool mayJoinAnother() const override { return false; }
};

class HEventManager {
 public:
  using Listener = std::function<void(HEvent const&)>;

  HEventManager() = default;
  ~HEventManager();
  HEventManager(HEventManager const&) = delete;
  HEventManager& operator=(HEventManager const&) = delete;

  // Queues a copy of the event, from any thread: here, or with the current manager of the thread.
  void submit(HEvent const& event);
  static void safeSubmit(HEvent const& event);
  // Delivers the event at once; the scene's thread only. Returns whether anyone listens.
  bool submitImmediate(HEvent const& event);
  // Delivers what is queued, also what listeners submit meanwhile; the scene's thread only.
  void deliverQueued();

  // Returns a number to stop listening with.
  int addListener(Listener listener);
  void removeListener(int number);

 private:
  HCriticalSection m_section;  // guards the queue
  std::deque<std::unique_ptr<HEvent>> m_queue;
  std::vector<std::pair<int, Listener>> m_listeners;
  int m_lastNumber = 0;
};

// That of the thread's current scene; of the default scene on a thread that has none.
extern TALIX_THREAD_LOCAL HEventManager* g_eventManager;
