#include "host/animation/PropertyTable.h"

#include "host/scene/Module.h"

PropertyTable& PropertyTable::getInstance() {
  static PropertyTable table;
  return table;
}

void PropertyTable::reset() {
  m_entries.clear();
  m_ids.clear();
  m_idsByLowerName.clear();
  add("Translation", DataSource::Vec3Property);
  add("Rotation", DataSource::RotProperty);
  add("Scale", DataSource::Vec3Property);
  add("Occluded", DataSource::BoolProperty);
  add("Residual", DataSource::FloatProperty);
  add("Weight", DataSource::FloatProperty);
  add("FocalLength", DataSource::FloatProperty);
  add("Threshold", DataSource::IntProperty);
  add("Length", DataSource::FloatProperty);
  add("FillType", DataSource::IntProperty);
}

unsigned PropertyTable::findId(HString const& name) const {
  const auto found = m_ids.find(name.GetString());
  return found == m_ids.end() ? 0 : found->second;
}

HString PropertyTable::getName(unsigned id) const {
  id &= kIdMask;
  return id == 0 || id > m_entries.size() ? HString() : m_entries[id - 1].name;
}

DataSource::PropertyType PropertyTable::getType(unsigned id) const {
  id &= kIdMask;
  return id == 0 || id > m_entries.size() ? DataSource::NoProperty : m_entries[id - 1].type;
}

unsigned PropertyTable::add(HString const& name, DataSource::PropertyType type) {
  if (const unsigned known = findId(name)) return getType(known) == type ? known : 0;
  if (!Module::isValidPropertyName(name) || m_entries.size() == kIdMask) return 0;
  m_entries.push_back({name, type});
  const auto id = static_cast<unsigned>(m_entries.size());
  m_ids.emplace(name.GetString(), id);
  HString lower = name;
  lower.MakeLower();
  m_idsByLowerName[lower.GetString()].push_back(id);
  return id;
}

HString PropertyTable::restoreCase(HString const& name) const {
  if (findId(name)) return name;
  HString lower = name;
  lower.MakeLower();
  const auto found = m_idsByLowerName.find(lower.GetString());
  return found == m_idsByLowerName.end() || found->second.size() != 1 ? HString()
                                                                      : getName(found->second.front());
}
