// Long operations: what is being done, how far it is, and whether the user cancelled it. Tasks may stand
// inside each other.
#pragma once

#include <atomic>
#include <functional>
#include <vector>

#include "host/base/HString.h"

class OperationStack {
 public:
  struct Task {
    HString caption;
    int first = 0, last = 0, position = 0, step = 1;
    bool cancellable = false;
  };
  // Told after each change of the innermost task, with null when the last one ends.
  using Display = std::function<void(Task const*)>;

  // A task from `first` to `last`, at `position`, that each stepTask moves by `step`. False when the user has
  // cancelled already.
  bool pushTask(int first, int last, int position, int step, bool cancellable, HString const& caption);
  // Popping an empty stack does nothing.
  void popTask();
  void setTaskCaption(HString const& caption);
  void setTaskPos(int position);
  void stepTask();

  int getNumTasks() const { return static_cast<int>(m_tasks.size()); }
  bool isCancelled() const { return m_cancelled; }
  // Safe from any thread and from a signal handler.
  void cancel() { m_cancelled = true; }
  // Drops all tasks and the cancel mark: whoever runs commands calls it after each.
  void reset();

  void setDisplay(Display display) { m_display = std::move(display); }

 private:
  void show() const;

  std::vector<Task> m_tasks;
  std::atomic<bool> m_cancelled = false;
  Display m_display;
};

extern OperationStack g_theOperationStack;
