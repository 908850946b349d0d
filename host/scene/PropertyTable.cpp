#include "host/scene/PropertyTable.h"

#include <string_view>

#include "host/scene/Database.h"

PropertyTable& PropertyTable::getInstance() { return Database::current().getPropertyTable(); }

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

// The last name added: later ones have gone before it.
struct PropertyTable::Addition : UndoChange {
  Addition(PropertyTable& concerned, HString const& text, DataSource::PropertyType kind)
      : UndoChange(nullptr), table(concerned), name(text), type(kind) {}
  void swap() override {
    const bool now = table.findId(name) != 0;
    if (now != isThere) isThere ? static_cast<void>(table.store(name, type)) : table.removeLast();
    isThere = now;
  }
  int64 memoryUse() const override { return static_cast<int64>(sizeof *this + name.GetString().size()); }

  void tell(ChangeSetBuilder&) const override {}  // shows in the channels that have the name

  PropertyTable& table;
  HString name;
  DataSource::PropertyType type;
  bool isThere = false;  // in the other state
};

unsigned PropertyTable::add(HString const& name, DataSource::PropertyType type) {
  if (const unsigned known = findId(name)) return getType(known) == type ? known : 0;
  if (!Module::isValidPropertyName(name) || m_entries.size() == kIdMask) return 0;
  if (m_journal.isRecording()) m_journal.add(std::make_unique<Addition>(*this, name, type));
  return store(name, type);
}

unsigned PropertyTable::store(HString const& name, DataSource::PropertyType type) {
  HString lower = name;
  lower.MakeLower();
  std::vector<unsigned>& sameButCase = m_idsByLowerName[lower.GetString()];
  sameButCase.reserve(sameButCase.size() + 1);
  m_entries.reserve(m_entries.size() + 1);
  Entry entry{name, type};
  const auto id = static_cast<unsigned>(m_entries.size() + 1);
  m_ids.emplace(name.GetString(), id);
  // What may fail has been done.
  sameButCase.push_back(id);
  m_entries.push_back(std::move(entry));
  return id;
}

void PropertyTable::removeLast() {
  HString lower = m_entries.back().name;
  m_ids.erase(lower.GetString());
  lower.MakeLower();
  const auto known = m_idsByLowerName.find(lower.GetString());
  known->second.pop_back();
  if (known->second.empty()) m_idsByLowerName.erase(known);
  m_entries.pop_back();
}

HString PropertyTable::restoreCase(HString const& name) const {
  if (findId(name)) return name;
  HString lower = name;
  lower.MakeLower();
  const auto found = m_idsByLowerName.find(lower.GetString());
  return found == m_idsByLowerName.end() || found->second.size() != 1 ? HString()
                                                                      : getName(found->second.front());
}

// --- the names as commands ask for them ---

DataSource::PropertyType Controller::mapToPropertyType(HString const& name) {
  return mapToPropertyType(mapPropertyName(name));
}

DataSource::PropertyType Controller::mapToPropertyType(unsigned id) {
  return PropertyTable::getInstance().getType(id);
}

HString Controller::getName() const { return getDatabase()->getPropertyTable().getName(m_propertyId); }

HString Controller::mapPropertyId(unsigned id) { return PropertyTable::getInstance().getName(id); }

unsigned Controller::mapPropertyName(HString const& name) {
  return PropertyTable::getInstance().findId(name);
}

void Controller::fixChannelStr(HString& text) {
  static constexpr std::string_view kBlanks = " \t\r\n";
  std::string const& given = text.GetString();
  const size_t first = given.find_first_not_of(kBlanks);
  if (first == std::string::npos) {
    text = "";
    return;
  }
  std::string trimmed = given.substr(first, given.find_last_not_of(kBlanks) - first + 1);

  if (trimmed.size() == 2) {
    const char channel = static_cast<char>(trimmed[0] | 0x20),
               component = static_cast<char>(trimmed[1] | 0x20);
    char const* name = channel == 't'   ? "Translation"
                       : channel == 'r' ? "Rotation"
                       : channel == 's' ? "Scale"
                                        : nullptr;
    // A channel that really has such a name is meant itself.
    if (name && component >= 'x' && component <= 'z' && !mapPropertyName(HString(trimmed))) {
      text = std::string(name) + "." + component;
      return;
    }
  }
  PropertyTable const& table = PropertyTable::getInstance();
  HString known = table.restoreCase(HString(trimmed));
  const size_t dot = trimmed.rfind('.');
  if (known.IsEmpty() && dot != std::string::npos) {
    known = table.restoreCase(HString(trimmed.substr(0, dot)));
    if (!known.IsEmpty()) known += HString(trimmed.substr(dot));
  }
  text = known.IsEmpty() ? HString(std::move(trimmed)) : known;
}
