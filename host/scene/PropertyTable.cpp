#include "host/scene/PropertyTable.h"

#include <algorithm>
#include <string_view>

#include "host/base/Text.h"
#include "host/scene/Database.h"

namespace {

std::string lowerCase(HString name) {
  name.MakeLower();
  return name.GetString();
}

// "ty" is short for "Translation.y". Empty for other texts.
std::string longForm(std::string_view name) {
  if (name.size() != 2) return {};
  char const channel = static_cast<char>(name[0] | 0x20), component = static_cast<char>(name[1] | 0x20);
  char const* whole = channel == 't'   ? "Translation"
                      : channel == 'r' ? "Rotation"
                      : channel == 's' ? "Scale"
                                       : nullptr;
  return whole && component >= 'x' && component <= 'z' ? std::string(whole) + "." + component : std::string();
}

constexpr std::string_view kBuiltInAttributes[] = {
    "color",       "deviceid",  "dofs",    "intrinsics", "locked",      "majoraxis",
    "markers",     "minoraxis", "name",    "offset",     "reset",       "rotationorder",
    "smpteoffset", "source",    "sources", "target",     "temperature", "visible"};
static_assert(std::ranges::is_sorted(kBuiltInAttributes));

}  // namespace

PropertyTable& PropertyTable::getInstance() { return Database::current().getPropertyTable(); }

void PropertyTable::reset() {
  m_entries.clear();
  m_ids.clear();
  m_idsByLowerName.clear();
  m_attributes.clear();
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
  auto const found = m_ids.find(name.GetString());
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
    bool const now = table.findId(name) != 0;
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

// A name for custom attributes.
struct PropertyTable::AttributeAddition : UndoChange {
  AttributeAddition(PropertyTable& concerned, std::string lowerName)
      : UndoChange(nullptr), table(concerned), name(std::move(lowerName)) {}
  void swap() override {
    bool const now = table.m_attributes.contains(name);
    if (now != isThere)
      isThere ? static_cast<void>(table.m_attributes.insert(name))
              : static_cast<void>(table.m_attributes.erase(name));
    isThere = now;
  }
  int64 memoryUse() const override { return static_cast<int64>(sizeof *this + name.size()); }
  void tell(ChangeSetBuilder&) const override {}  // shows in the attributes that have the name

  PropertyTable& table;
  std::string name;
  bool isThere = false;  // in the other state
};

HString PropertyTable::obstacleTo(HString const& name) const {
  std::string const& text = name.GetString();
  if (!text.empty() && text.find_first_of(".\\") == std::string::npos && withoutOuterBlanks(text) == text)
    return {};
  return "it must not be empty, hold a dot or a backslash, nor begin or end with a blank";
}

HString PropertyTable::obstacleToChannel(HString const& name, DataSource::PropertyType type) const {
  HString text = obstacleTo(name);
  if (!text.IsEmpty()) return text;
  unsigned const known = findId(name);
  if (known && getType(known) != type)
    text.Format("it is the name of %s channels", getTypeName(getType(known)));
  else if (isBuiltInAttribute(name) || m_attributes.contains(lowerCase(name)))
    text = "it is the name of an attribute";
  return text;
}

HString PropertyTable::obstacleToAttribute(HString const& name) const {
  HString text = obstacleTo(name);
  if (!text.IsEmpty()) return text;
  if (m_idsByLowerName.contains(lowerCase(name)))
    text = "it is the name of a channel";
  else if (std::string const whole = longForm(name.GetString()); !whole.empty())
    text.Format("it is short for %s", whole.c_str());
  return text;
}

bool PropertyTable::isBuiltInAttribute(HString const& name) {
  return std::ranges::binary_search(kBuiltInAttributes, lowerCase(name));
}

char const* PropertyTable::getTypeName(DataSource::PropertyType type) {
  switch (type) {
    case DataSource::Vec3Property:
      return "vector";
    case DataSource::RotProperty:
      return "rotation";
    case DataSource::FloatProperty:
      return "float";
    case DataSource::IntProperty:
      return "int";
    case DataSource::BoolProperty:
      return "bool";
    case DataSource::NoProperty:
      break;
  }
  return "";
}

unsigned PropertyTable::add(HString const& name, DataSource::PropertyType type) {
  if (!obstacleToChannel(name, type).IsEmpty()) return 0;
  if (unsigned const known = findId(name)) return known;
  if (m_entries.size() == kIdMask) return 0;
  if (m_journal.isRecording()) m_journal.add(std::make_unique<Addition>(*this, name, type));
  return store(name, type);
}

bool PropertyTable::addAttribute(HString const& name) {
  if (!obstacleToAttribute(name).IsEmpty()) return false;
  std::string const lower = lowerCase(name);
  if (m_attributes.contains(lower)) return true;
  if (m_journal.isRecording()) m_journal.add(std::make_unique<AttributeAddition>(*this, lower));
  m_attributes.insert(lower);
  return true;
}

unsigned PropertyTable::store(HString const& name, DataSource::PropertyType type) {
  std::vector<unsigned>& sameButCase = m_idsByLowerName[lowerCase(name)];
  sameButCase.reserve(sameButCase.size() + 1);
  if (m_entries.size() == m_entries.capacity()) m_entries.reserve(2 * m_entries.size() + 16);
  Entry entry{name, type};
  auto const id = static_cast<unsigned>(m_entries.size() + 1);
  m_ids.emplace(name.GetString(), id);
  // What may fail has been done.
  sameButCase.push_back(id);
  m_entries.push_back(std::move(entry));
  return id;
}

void PropertyTable::removeLast() {
  HString const& name = m_entries.back().name;
  m_ids.erase(name.GetString());
  auto const known = m_idsByLowerName.find(lowerCase(name));
  known->second.pop_back();
  if (known->second.empty()) m_idsByLowerName.erase(known);
  m_entries.pop_back();
}

HString PropertyTable::restoreCase(HString const& name) const {
  if (findId(name)) return name;
  auto const found = m_idsByLowerName.find(lowerCase(name));
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
  std::string name(withoutOuterBlanks(text.GetString()));
  // A channel that really has such a name is meant itself.
  if (std::string const whole = longForm(name); !whole.empty() && !mapPropertyName(HString(name))) {
    text = whole;
    return;
  }
  PropertyTable const& table = PropertyTable::getInstance();
  HString known = table.restoreCase(HString(name));
  size_t const dot = name.rfind('.');
  if (known.IsEmpty() && dot != std::string::npos) {
    known = table.restoreCase(HString(name.substr(0, dot)));
    if (!known.IsEmpty()) known += HString(name.substr(dot));
  }
  text = known.IsEmpty() ? HString(std::move(name)) : known;
}
