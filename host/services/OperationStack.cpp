#include "host/services/OperationStack.h"

OperationStack g_theOperationStack;

bool OperationStack::pushTask(int first, int last, int position, int step, bool cancellable,
                              HString const& caption) {
  m_tasks.push_back({caption, first, last, position, step, cancellable});
  show();
  return !m_cancelled;
}

void OperationStack::popTask() {
  if (m_tasks.empty()) return;
  m_tasks.pop_back();
  show();
}

void OperationStack::setTaskCaption(HString const& caption) {
  if (m_tasks.empty()) return;
  m_tasks.back().caption = caption;
  show();
}

void OperationStack::setTaskPos(int position) {
  if (m_tasks.empty()) return;
  m_tasks.back().position = position;
  show();
}

void OperationStack::stepTask() {
  if (!m_tasks.empty()) setTaskPos(m_tasks.back().position + m_tasks.back().step);
}

void OperationStack::reset() {
  const bool shown = !m_tasks.empty();
  m_tasks.clear();
  m_cancelled = false;
  if (shown) show();
}

void OperationStack::show() const {
  if (m_display) m_display(m_tasks.empty() ? nullptr : &m_tasks.back());
}
