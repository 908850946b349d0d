#include "host/scene/Selection.h"

#include "host/scene/ChangeSetBuilder.h"

// What was selected and deselected in a step, one after the other.
struct Selection::Change : UndoChange {
  explicit Change(Selection& concerned)
      : UndoChange(nullptr), selection(concerned), primary(concerned.m_primary) {}

  void swap() override {
    auto const put = [this](Entry& entry, bool selected) {
      if (!selected) return selection.take(entry.module);
      if (entry.module->isSelected()) return;
      entry.module->m_selectionOrder = entry.order;
      selection.insert(entry.module);
    };
    if (done) {
      for (auto entry = entries.rbegin(); entry != entries.rend(); ++entry) put(*entry, entry->was);
    } else {
      for (Entry& entry : entries) put(entry, !entry.was);
    }
    done = !done;
    std::swap(primary, selection.m_primary);
  }
  // Nothing, or a selection replaced by itself.
  bool isVoid() const override {
    if (primary != selection.m_primary) return false;
    size_t const half = entries.size() / 2;
    if (entries.size() % 2 != 0 || (half > 0 && selection.getCount() != static_cast<int>(half))) return false;
    for (size_t i = 0; i < half; ++i)
      if (entries[i].module != entries[half + i].module || entries[i].order >= entries[half + i].order)
        return false;
    return true;
  }
  int64 memoryUse() const override {
    return static_cast<int64>(sizeof *this + entries.capacity() * sizeof(Entry));
  }

  void tell(ChangeSetBuilder& changes) const override {
    constexpr auto kind = SceneChange::Kind::selection;
    auto const text = [](bool selected) { return selected ? "true" : "false"; };
    for (auto entry = entries.rbegin(); entry != entries.rend(); ++entry)
      changes.tell(kind, entry->module, "", text(entry->was), text(entry->module->isSelected()));
    changes.tell(kind, nullptr, "Primary", textOf(primary), textOf(selection.m_primary),
                 primary != selection.m_primary);
  }

  struct Entry {
    Module* module;
    uint64 order : 63;  // when it is selected
    uint64 was : 1;     // selected before
  };
  Selection& selection;
  Module* primary;
  std::vector<Entry> entries;
  bool done = true;
};

void Selection::record(Module* module) {
  if (!m_journal.isRecording()) return;
  if (auto* change = m_journal.addOnce<Change>(m_undoMark, *this)) m_change = change;
  if (module) m_change->entries.push_back({module, module->m_selectionOrder, module->isSelected()});
}

void Selection::insert(Module* module) {
  int const count = getCount();
  m_unsorted |= count > 0 && at(count - 1)->m_selectionOrder > module->m_selectionOrder;
  try {
    m_modules.append(module);
    if (auto* node = objectAs<Node>(module)) m_nodes.append(node);
    if (auto* marker = objectAs<Marker>(module)) m_markers.append(marker);
    if (auto* character = objectAs<Character>(module)) m_characters.append(character);
    if (auto* bone = objectAs<LabelingBone>(module)) m_bones.append(bone);
  } catch (...) {
    take(module);
    throw;
  }
}

void Selection::take(Module* module) noexcept {
  m_modules.remove(module);
  if (auto* node = objectAs<Node>(module)) m_nodes.remove(node);
  if (auto* marker = objectAs<Marker>(module)) m_markers.remove(marker);
  if (auto* character = objectAs<Character>(module)) m_characters.remove(character);
  if (auto* bone = objectAs<LabelingBone>(module)) m_bones.remove(bone);
}

void Selection::add(Module* module) {
  if (module->isSelected()) return;
  record(nullptr);  // the primary before it
  module->m_selectionOrder = ++m_selected;
  record(module);
  insert(module);
  m_primary = module;
}

void Selection::remove(Module* module) {
  if (!module->isSelected()) return;
  record(module);
  take(module);
  if (m_primary == module) m_primary = getCount() ? at(getCount() - 1) : nullptr;
}

void Selection::clear() {
  record(nullptr);
  if (m_journal.isRecording())
    for (Module* module : m_modules.toVector()) record(module);
  m_modules.clear();
  m_nodes.clear();
  m_markers.clear();
  m_characters.clear();
  m_bones.clear();
  m_primary = nullptr;
}

void Selection::setPrimary(Module* module) {
  if (module) add(module);
  record(nullptr);
  m_primary = module;
}

void Selection::restoreOrder() {
  if (!m_unsorted) return;
  auto const earlier = [](Module const* a, Module const* b) {
    return a->m_selectionOrder < b->m_selectionOrder;
  };
  m_modules.sort(earlier);
  m_nodes.sort(earlier);
  m_markers.sort(earlier);
  m_characters.sort(earlier);
  m_bones.sort(earlier);
  m_unsorted = false;
}
