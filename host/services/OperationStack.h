// Long operations: what is being done, how far it is, and whether the user cancelled it. Tasks may stand
// inside each other. Each scene has a stack.
#pragma once

#include <functional>
#include <memory>

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
  enum EScene { CurrentScene };

  OperationStack();
  // Has no tasks of its own: every call goes to the stack of the thread's current scene.
  explicit OperationStack(EScene);
  ~OperationStack();

  // A task from `first` to `last`, at `position`, that each stepTask moves by `step`. False when the user has
  // cancelled already.
  bool pushTask(int first, int last, int position, int step, bool cancellable, HString const& caption);
  // Popping an empty stack does nothing.
  void popTask();
  void setTaskCaption(HString const& caption);
  void setTaskPos(int position);
  void stepTask();

  int getNumTasks() const;
  bool isCancelled() const;
  // Safe from any thread and from a signal handler.
  void cancel();
  // Drops all tasks and the cancel mark: whoever runs commands calls it after each.
  void reset();

  void setDisplay(Display display);

 private:
  struct State;
  State& state() const;

  std::unique_ptr<State> m_own;
};

// That of the thread's current scene; of the default scene on a thread that has none.
extern OperationStack g_theOperationStack;

// A task of which parts are done, as long as the object lives; the user may cancel it.
class OperationTask {
 public:
  explicit OperationTask(HString const& caption) {
    g_theOperationStack.pushTask(0, kSteps, 0, 1, true, caption);
  }
  ~OperationTask() { g_theOperationStack.popTask(); }
  OperationTask(OperationTask const&) = delete;
  OperationTask& operator=(OperationTask const&) = delete;

  // So much is done of the whole.
  static void tell(double done, double whole) {
    g_theOperationStack.setTaskPos(static_cast<int>(whole > 0 ? kSteps * (done / whole) : kSteps));
  }

 private:
  static constexpr int kSteps = 1000;
};
