// The selected modules: an ordered list without repeats, and a primary one. Nodes, markers, characters and
// labelling bones among them are found as fast as any.
#pragma once

#include "host/scene/Bones.h"
#include "host/scene/Character.h"
#include "host/scene/Marker.h"

class Selection {
 public:
  // journal: that of the scene, to which changes are told.
  explicit Selection(UndoJournal& journal) : m_journal(journal) {}

  // Mutators. The last selected module is primary unless another is set.
  void add(Module* module);
  void remove(Module* module);
  void clear();
  void setPrimary(Module* module);  // null: none
  // Puts the lists in order again after undo and redo.
  void restoreOrder();

  Module* getPrimary() const { return m_primary; }
  int getCount() const { return m_modules.getCount(); }
  Module* at(int i) const { return m_modules.at(i); }
  int getNumNodes() const { return m_nodes.getCount(); }
  Node* getNode(int i) const { return m_nodes.at(i); }
  int getNumMarkers() const { return m_markers.getCount(); }
  Marker* getMarker(int i) const { return m_markers.at(i); }
  int getNumCharacters() const { return m_characters.getCount(); }
  Character* getCharacter(int64 i) const { return m_characters.at(i); }
  int getNumLabelingBones() const { return m_bones.getCount(); }
  LabelingBone* getLabelingBone(int i) const { return m_bones.at(i); }

 private:
  struct Change;
  void record(Module* module);  // a module that is about to be selected or deselected, null: primary only
  void insert(Module* module);
  void take(Module* module) noexcept;

  UndoJournal& m_journal;
  OrderedList<Module, &Module::m_selectionSlot> m_modules;
  OrderedList<Node, &Node::m_selectedNodeSlot> m_nodes;
  OrderedList<Marker, &Marker::m_selectedMarkerSlot> m_markers;
  OrderedList<Character, &Character::m_selectedSubjectSlot> m_characters;
  OrderedList<LabelingBone, &LabelingBone::m_selectedLabelingBoneSlot> m_bones;
  Module* m_primary = nullptr;
  uint64 m_selected = 0;  // counts what was ever selected
  bool m_unsorted = false;
  uint64 m_undoMark = 0;
  Change* m_change = nullptr;  // that of the step in m_undoMark
};
