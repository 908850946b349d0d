// What was changed, step by step, so that it can be taken back and done again.
//
// Every kind of scene state has one mutator, which records the state that it replaces. A change holds the
// *other* state of what it concerns: undoing and redoing both swap it with the present one. A step undoes its
// changes from the last to the first and redoes them from the first to the last.
//
//  1. Within a step a field that depends on nothing else (a value, a track of keys) is recorded once, at its
//     first change; what depends on order (names, parents, membership, selection) is recorded each time.
//  2. A module that came into the scene within the step needs no records of its own: it comes and goes whole.
//  3. A module lives as long as a change tells of it, in the scene or out of it.
//  4. A new step that changed something drops what could be redone.
//  5. A change is added before the scene changes. Swapping it brings the recorded state back wherever the
//  mutator
//     stopped after that, so that a step which ran out of memory can be discarded.
//
// Current time and the priority module are no part of it.
#pragma once

#include <memory>
#include <utility>

#include "host/base/HString.h"
#include "host/base/OutOfMemory.h"
#include "host/scene/ChangeSet.h"
#include "host/scene/UndoSteps.h"

class ChangeSetBuilder;
class Database;
struct SceneAside;

class UndoChange {
 public:
  // `owner`: the module that the change tells of; null for the scene's own state.
  explicit UndoChange(Module* owner) : m_owner(owner) {}
  virtual ~UndoChange() = default;
  UndoChange(UndoChange const&) = delete;
  UndoChange& operator=(UndoChange const&) = delete;

  virtual void swap() = 0;
  // Whether both states are the same.
  virtual bool isVoid() const { return false; }
  // Bytes held, in whichever of its states holds more.
  virtual int64 memoryUse() const = 0;

  // Whether a kept step holds it as a few bytes, which pack() appends.
  virtual bool isSmall() const { return false; }
  virtual void pack(PackedStep&) const {}
  // Tells what the scene was before, as long as it is as the change left it. Of several changes of one thing
  // in a step the first counts, which is told last.
  virtual void tell(ChangeSetBuilder& changes) const = 0;

 private:
  ModuleHold m_owner;
};

class UndoJournal {
 public:
  explicit UndoJournal(Database& scene);
  ~UndoJournal();
  UndoJournal(UndoJournal const&) = delete;
  UndoJournal& operator=(UndoJournal const&) = delete;

  // Off at start: nothing is recorded. Switching off forgets everything.
  void setEnabled(bool enabled);
  bool isEnabled() const { return m_enabled; }

  // Steps may stand inside each other: the outermost counts. Throws std::bad_alloc, and the step is not open,
  // when there is not even the memory to take it back.
  void beginStep();
  // `name`: what is shown when the step is undone. Nothing changed, no step. On an exception the step is open
  // still.
  void endStep(HString const& name);
  // Takes back what the open step, and all that stand in it, changed, with current time, priority module and
  // key clipboard; nothing stays of it. False when that is not known in full: steps are not kept, or were
  // forgotten meanwhile.
  bool discardStep();

  // Takes back the last step (does the next one again). False when there is none. A step that is open must
  // have changed nothing yet. `name`: that of the step.
  bool undo(HString& name);
  bool redo(HString& name);
  int getNumUndoSteps() const { return m_done.getCount(); }
  int getNumRedoSteps() const { return m_undone.getCount(); }
  // What the step that is open has changed so far, else what the last step did that can be undone. Worked out
  // when asked for, at the cost of what differs.
  ChangeSet getChanges() const;
  // Forgets everything, the step that is open included, which is not recorded any further.
  void clear();

  // Bytes that the steps may hold; the oldest go first. A step that is larger by itself goes as well, with a
  // warning.
  void setMemoryLimit(int64 bytes) { m_memoryLimit = bytes; }
  int64 getMemoryUse() const { return m_done.getMemory() + m_undone.getMemory(); }

  // --- for mutators ---
  // The step that is open and being recorded; 0 for none.
  uint64 getStep() const { return m_step; }
  bool isRecording() const { return m_step != 0; }
  // Only while recording.
  void add(std::unique_ptr<UndoChange> change);
  // Adds a change of a field that was last recorded in step `mark`, unless that is the one that is open. The
  // change; null when nothing is to be recorded.
  template <class Change, class... Args>
  Change* addOnce(uint64& mark, Args&&... args) {
    if (mark == m_step || m_step == 0) return nullptr;
    auto change = std::make_unique<Change>(std::forward<Args>(args)...);
    Change* added = change.get();
    add(std::move(change));
    mark = m_step;
    return added;
  }

 private:
  bool move(UndoSteps& from, UndoSteps& to, bool backward, HString& name);
  void swapAll(UndoChanges& changes, bool backward) noexcept;
  void keep(HString const& name);

  Database& m_scene;
  bool m_enabled = false;
  int m_depth = 0;
  uint64 m_step = 0;
  uint64 m_lastStep = 0;
  int m_moves = 0;  // steps undone, less those redone, since the open step began
  UndoChanges m_open;
  std::unique_ptr<SceneAside> m_aside;  // as it was when the open step began
  UndoTables m_tables;
  UndoSteps m_done{m_tables}, m_undone{m_tables};  // the next one to be undone or redone is the last
  int64 m_memoryLimit = int64{1} << 30;
  MemoryReserve m_reserve;  // for taking back
};
