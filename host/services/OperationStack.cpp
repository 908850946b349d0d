#include "host/services/OperationStack.h"

#include <atomic>
#include <vector>

#include "host/services/SceneServices.h"

OperationStack g_theOperationStack(OperationStack::CurrentScene);

struct OperationStack::State {
  void show() const {
    if (display) display(tasks.empty() ? nullptr : &tasks.back());
  }

  std::vector<Task> tasks;
  std::atomic<bool> cancelled = false;
  Display display;
};

OperationStack::OperationStack() : m_own(std::make_unique<State>()) {}

OperationStack::OperationStack(EScene) {}

OperationStack::~OperationStack() = default;

OperationStack::State& OperationStack::state() const {
  return m_own ? *m_own : *SceneServices::getCurrent().operations.m_own;
}

bool OperationStack::pushTask(int first, int last, int position, int step, bool cancellable,
                              HString const& caption) {
  State& own = state();
  own.tasks.push_back({caption, first, last, position, step, cancellable});
  own.show();
  return !own.cancelled;
}

void OperationStack::popTask() {
  State& own = state();
  if (own.tasks.empty()) return;
  own.tasks.pop_back();
  own.show();
}

void OperationStack::setTaskCaption(HString const& caption) {
  State& own = state();
  if (own.tasks.empty()) return;
  own.tasks.back().caption = caption;
  own.show();
}

void OperationStack::setTaskPos(int position) {
  State& own = state();
  if (own.tasks.empty()) return;
  own.tasks.back().position = position;
  own.show();
}

void OperationStack::stepTask() {
  State const& own = state();
  if (!own.tasks.empty()) setTaskPos(own.tasks.back().position + own.tasks.back().step);
}

int OperationStack::getNumTasks() const { return static_cast<int>(state().tasks.size()); }

bool OperationStack::isCancelled() const { return state().cancelled; }

void OperationStack::cancel() { state().cancelled = true; }

void OperationStack::reset() {
  State& own = state();
  bool const shown = !own.tasks.empty();
  own.tasks.clear();
  own.cancelled = false;
  if (shown) own.show();
}

void OperationStack::setDisplay(Display display) { state().display = std::move(display); }
