#include "host/scene/UndoJournal.h"

#include <algorithm>
#include <string>
#include <utility>

#include "host/scene/Database.h"

UndoChange::UndoChange(Module* owner) : m_owner(owner) {
  if (m_owner) ++m_owner->m_undoHolds;
}

UndoChange::~UndoChange() {
  if (m_owner && --m_owner->m_undoHolds == 0 && !m_owner->isInScene()) delete m_owner;
}

void UndoJournal::setEnabled(bool enabled) {
  m_enabled = enabled;
  if (!enabled) clear();
}

void UndoJournal::beginStep() {
  if (m_depth == 0 && m_enabled) {
    if (!m_reserve.fill()) throw std::bad_alloc();
    m_step = ++m_lastStep;
  }
  ++m_depth;
}

void UndoJournal::add(std::unique_ptr<UndoChange> change) { m_open.push_back(std::move(change)); }

void UndoJournal::endStep(HString const& name) {
  if (m_depth == 1 && !m_open.empty()) keep(name);
  if (--m_depth == 0) m_step = 0;
}

void UndoJournal::keep(HString const& name) {
  const bool changed =
      std::any_of(m_open.begin(), m_open.end(), [](auto const& change) { return !change->isVoid(); });
  if (!changed) {
    // What is hidden, as the numbers behind the order of the selection, becomes what earlier steps know.
    swapAll(m_open, true);
    m_open.clear();
    return;
  }

  Step step;
  step.name = name;
  m_open.shrink_to_fit();
  step.memory = static_cast<int64>(sizeof step + m_open.capacity() * sizeof m_open[0]);
  for (auto const& change : m_open) step.memory += change->memoryUse();
  if (step.memory > m_memoryLimit) {
    writeLog(LogLevel::Warning, name.GetString() + " needs more memory to be undone (" +
                                    std::to_string(step.memory / 1000000) + " MB) than undo may use (" +
                                    std::to_string(m_memoryLimit / 1000000) + " MB) and cannot be undone.");
  }
  m_done.push_back(std::move(step));
  // Nothing fails from here on.
  m_done.back().changes.swap(m_open);
  m_memoryUse += m_done.back().memory;
  for (Step const& undone : m_undone) m_memoryUse -= undone.memory;
  m_undone.clear();
  for (; !m_done.empty() && m_memoryUse > m_memoryLimit; m_done.pop_front())
    m_memoryUse -= m_done.front().memory;
}

bool UndoJournal::discardStep() {
  const bool known = m_step != 0 || m_depth == 0;
  m_depth = 0;
  swapAll(m_open, true);
  m_step = 0;
  m_open.clear();
  return known;
}

void UndoJournal::swapAll(Changes& changes, bool backward) noexcept {
  const uint64 step = std::exchange(m_step, 0);
  const MustFinish mustFinish(m_reserve);
  if (backward) {
    for (auto change = changes.rbegin(); change != changes.rend(); ++change) (*change)->swap();
  } else {
    for (auto const& change : changes) change->swap();
  }
  m_scene.restoreOrder();
  m_step = step;
}

bool UndoJournal::undo(HString& name) { return move(m_done, m_undone, true, name); }

bool UndoJournal::redo(HString& name) { return move(m_undone, m_done, false, name); }

bool UndoJournal::move(std::deque<Step>& from, std::deque<Step>& to, bool backward, HString& name) {
  if (from.empty() || !m_open.empty()) return false;
  name = from.back().name;
  to.push_back(std::move(from.back()));
  from.pop_back();
  swapAll(to.back().changes, backward);
  return true;
}

void UndoJournal::clear() {
  m_step = 0;
  m_undone.clear();
  m_open.clear();
  m_done.clear();
  m_memoryUse = 0;
}
