// Names of channels and attributes in a scene. One name is a channel's or an attribute's in all of it,
// whatever its case, since scripts write both alike; a channel name has one kind.
//
// An id is a small number (low 16 bits, from 1) to which the component bits of an active property may be
// added.
#pragma once

#include <optional>
#include <string>
#include <unordered_map>
#include <unordered_set>
#include <vector>

#include "host/base/HString.h"
#include "host/scene/DataSource.h"

class UndoJournal;

class PropertyTable {
 public:
  static constexpr unsigned kIdMask = 0xffff;
  static constexpr unsigned kX = 0x10000000, kY = 0x20000000, kZ = 0x40000000;
  static constexpr unsigned kWhole = kX | kY | kZ;

  // journal: that of the scene, to which additions are told.
  explicit PropertyTable(UndoJournal& journal) : m_journal(journal) { reset(); }
  PropertyTable(PropertyTable const&) = delete;
  PropertyTable& operator=(PropertyTable const&) = delete;

  static PropertyTable& getInstance();  // that of the current scene

  // Back to the built-in channels: "Translation", "Rotation", "Scale", "Occluded", "Residual", "Weight",
  // "FocalLength", "Threshold", "Length", "FillType".
  void reset();

  // 0 when there is no such channel name.
  unsigned findId(HString const& name) const;
  HString getName(unsigned id) const;  // empty when unknown
  DataSource::PropertyType getType(unsigned id) const;

  // Why a name cannot be that of a channel of a kind, or of a custom attribute, as the end of a sentence ("it
  // must not ..."); empty when it can.
  HString obstacleToChannel(HString const& name, DataSource::PropertyType type) const;
  HString obstacleToAttribute(HString const& name) const;

  // The id of a channel name, which is added when it is new. 0 when there is an obstacle, or the table is
  // full (65,535 names).
  unsigned add(HString const& name, DataSource::PropertyType type);
  // Takes a name for custom attributes. False when there is an obstacle.
  bool addAttribute(HString const& name);
  // Whether some class of modules has a built-in attribute of that name. The names are listed here since no
  // module of a class may exist yet.
  static bool isBuiltInAttribute(HString const& name);

  // "vector", "rotation", "float", "int", "bool"
  static char const* getTypeName(DataSource::PropertyType type);

  // The known name that is equal but for case; empty when there is none, or none in exact case and several
  // others.
  HString restoreCase(HString const& name) const;

 private:
  struct Addition;
  struct AttributeAddition;
  HString obstacleTo(HString const& name) const;                       // whatever it is to name
  unsigned store(HString const& name, DataSource::PropertyType type);  // mutator: adds at the end
  void removeLast();

  struct Entry {
    HString name;
    DataSource::PropertyType type;
  };
  UndoJournal& m_journal;
  std::vector<Entry> m_entries;  // id - 1
  std::unordered_map<std::string, unsigned> m_ids;
  std::unordered_map<std::string, std::vector<unsigned>> m_idsByLowerName;
  std::unordered_set<std::string> m_attributes;  // custom ones, in lower case
};
