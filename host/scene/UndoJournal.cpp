#include "host/scene/UndoJournal.h"

#include <algorithm>
#include <string>

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
  if (m_depth++ == 0 && m_enabled) m_step = ++m_lastStep;
}

void UndoJournal::add(std::unique_ptr<UndoChange> change) { m_open.push_back(std::move(change)); }

void UndoJournal::endStep(HString const& name) {
  if (--m_depth > 0) return;
  m_step = 0;
  if (m_open.empty()) return;
  Step step;
  step.changes.swap(m_open);
  const bool changed = std::any_of(step.changes.begin(), step.changes.end(),
                                   [](auto const& change) { return !change->isVoid(); });
  if (!changed) {
    // What is hidden, as the numbers behind the order of the selection, becomes what earlier steps know.
    swapAll(step.changes, true);
    return;
  }

  step.name = name;
  step.changes.shrink_to_fit();
  step.memory = static_cast<int64>(sizeof step + step.changes.capacity() * sizeof step.changes[0]);
  for (auto const& change : step.changes) step.memory += change->memoryUse();
  m_memoryUse += step.memory;
  for (Step const& undone : m_undone) m_memoryUse -= undone.memory;
  m_undone.clear();
  m_done.push_back(std::move(step));
  keepWithinLimit();
}

void UndoJournal::keepWithinLimit() {
  while (!m_done.empty() && m_memoryUse > m_memoryLimit) {
    if (m_done.size() == 1) {
      writeLog(LogLevel::Warning, m_done.front().name.GetString() + " needs more memory to be undone (" +
                                      std::to_string(m_memoryUse / 1000000) + " MB) than undo may use (" +
                                      std::to_string(m_memoryLimit / 1000000) + " MB) and cannot be undone.");
    }
    m_memoryUse -= m_done.front().memory;
    m_done.pop_front();
  }
}

void UndoJournal::swapAll(Changes& changes, bool backward) {
  if (backward) {
    for (auto change = changes.rbegin(); change != changes.rend(); ++change) (*change)->swap();
  } else {
    for (auto const& change : changes) change->swap();
  }
  m_scene.restoreOrder();
}

bool UndoJournal::undo(HString& name) { return move(m_done, m_undone, true, name); }

bool UndoJournal::redo(HString& name) { return move(m_undone, m_done, false, name); }

bool UndoJournal::move(std::deque<Step>& from, std::deque<Step>& to, bool backward, HString& name) {
  if (from.empty() || !m_open.empty()) return false;
  const uint64 step = m_step;
  m_step = 0;
  to.push_back(std::move(from.back()));
  from.pop_back();
  swapAll(to.back().changes, backward);
  m_step = step;
  name = to.back().name;
  return true;
}

void UndoJournal::clear() {
  m_step = 0;
  m_undone.clear();
  m_open.clear();
  m_done.clear();
  m_memoryUse = 0;
}
