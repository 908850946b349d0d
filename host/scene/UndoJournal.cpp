#include "host/scene/UndoJournal.h"

#include <algorithm>
#include <string>
#include <utility>

#include "host/scene/ChangeSetBuilder.h"
#include "host/scene/Database.h"
#include "host/scene/SceneAside.h"

UndoJournal::UndoJournal(Database& scene) : m_scene(scene) {}

UndoJournal::~UndoJournal() { clear(); }

void UndoJournal::setEnabled(bool enabled) {
  m_enabled = enabled;
  if (!enabled) clear();
}

void UndoJournal::beginStep() {
  if (m_depth == 0 && m_enabled) {
    if (!m_reserve.fill()) throw std::bad_alloc();
    if (!m_aside) m_aside = std::make_unique<SceneAside>();
    m_scene.putAside(*m_aside);
    m_step = ++m_lastStep;
    m_moves = 0;
  }
  ++m_depth;
}

void UndoJournal::add(std::unique_ptr<UndoChange> change) { m_open.push_back(std::move(change)); }

void UndoJournal::endStep(HString const& name) {
  if (m_depth == 1 && !m_open.empty()) keep(name);
  if (--m_depth > 0) return;
  m_step = 0;
}

void UndoJournal::keep(HString const& name) {
  bool const changed =
      std::any_of(m_open.begin(), m_open.end(), [](auto const& change) { return !change->isVoid(); });
  if (!changed) {
    // What is hidden, as the numbers that give the order of the selection, becomes what earlier steps know.
    swapAll(m_open, true);
    m_open.clear();
    return;
  }

  m_done.push(m_open, name.GetString());
  // Steps that are forgotten destroy modules, whose referrers let go: nothing that is to be undone.
  m_step = 0;
  MustFinish const mustFinish(m_reserve);
  m_undone.clear();
  if (m_done.getMemory() > m_memoryLimit && m_done.getLastMemory() > m_memoryLimit) {
    writeLog(LogLevel::Warning, name.GetString() + " needs more memory to be undone (" +
                                    std::to_string(m_done.getLastMemory() / 1000000) +
                                    " MB) than undo may use (" + std::to_string(m_memoryLimit / 1000000) +
                                    " MB) and cannot be undone.");
  }
  while (m_done.getMemory() > m_memoryLimit) m_done.dropFirst();
}

bool UndoJournal::discardStep() {
  bool const open = m_step != 0, known = open || m_depth == 0;
  m_depth = 0;
  swapAll(m_open, true);
  m_step = 0;
  m_open.clear();
  HString name;
  while (open && m_moves > 0) redo(name);
  while (open && m_moves < 0) undo(name);
  if (open) m_scene.putBack(*m_aside);
  return known;
}

void UndoJournal::swapAll(UndoChanges& changes, bool backward) noexcept {
  uint64 const step = std::exchange(m_step, 0);
  MustFinish const mustFinish(m_reserve);
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

bool UndoJournal::move(UndoSteps& from, UndoSteps& to, bool backward, HString& name) {
  if (from.getCount() == 0 || !m_open.empty()) return false;
  MustFinish const mustFinish(m_reserve);
  std::string text;
  UndoChanges changes = from.pop(text);
  swapAll(changes, backward);
  to.push(changes, text);
  m_moves += backward ? 1 : -1;
  name = text;
  return true;
}

ChangeSet UndoJournal::getChanges() const {
  UndoChanges unpacked;
  UndoChanges const* changes =
      m_open.empty() && m_done.getCount() > 0 && m_depth == 0 ? m_done.getLast(unpacked) : &m_open;
  ChangeSetBuilder builder;
  for (auto change = changes->rbegin(); change != changes->rend(); ++change) (*change)->tell(builder);
  return builder.finish();
}

void UndoJournal::clear() {
  MustFinish const mustFinish(m_reserve);
  m_step = 0;
  m_undone.clear();
  m_open.clear();
  m_done.clear();
}
