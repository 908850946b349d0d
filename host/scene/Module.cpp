#include "host/scene/Module.h"

#include <algorithm>
#include <cassert>

#include "host/scene/DataEdit.h"
#include "host/scene/Database.h"
#include "host/scene/HTimeManager.h"
#include "host/scene/ModuleChildren.h"
#include "host/scene/PropertyTable.h"
#include "host/scene/SceneIndex.h"

H_DEFINE_ABSTRACT_CLASS(Module);

struct Module::OpenEdit {
  int depth = 0;
  struct Before {
    Controller* channel;
    Controller::State state;
  };
  std::vector<Before> before;
};

void ModuleReferrer::refer(Module* module) {
  if (!module) return;
  if (!module->m_referrers)
    module->m_referrers = std::make_unique<std::unordered_map<ModuleReferrer*, int>>();
  ++(*module->m_referrers)[this];
}

void ModuleReferrer::release(Module* module) {
  if (!module) return;
  auto const found = module->m_referrers->find(this);
  if (--found->second == 0) module->m_referrers->erase(found);
}

bool ModuleReferrer::refersTo(Module const* module) const {
  return module && module->m_referrers && module->m_referrers->contains(const_cast<ModuleReferrer*>(this));
}

void Module::forgetByAll() {
  while (m_referrers && !m_referrers->empty()) m_referrers->begin()->first->forget(this);
}

Module::Module() : m_database(&Database::current()) {}

Module::~Module() { forgetByAll(); }

void Module::setUp() {
  m_id = ControlID(++m_database->m_lastID);
  addBuiltIn<NameAttribute>("Name");
  addBuiltIn<BoolAttribute>("Visible", true);
  addBuiltIn<BoolAttribute>("Locked");
  addBuiltIn<ColorAttribute>("Color", Database::getDefaultModColor());
}

// --- names ---

bool Module::isValidName(HString const& name) {
  return !name.IsEmpty() && name.GetString().find('\\') == std::string::npos;
}

bool Module::setName(HString const& name) {
  if (!isValidName(name)) return false;
  if (name != m_name) storeName(name);
  return true;
}

HString Module::getPath(EPathType type) const {
  switch (type) {
    case NameOnly:
      return getName();
    case FullPath:
      return getFullPathString();
    case ShortestPath:
      break;
  }
  return getMinimumPathString(false);
}

std::string Module::suffixText(int levels) const {
  std::vector<Module const*> chain;
  for (Module const* module = this; module && static_cast<int>(chain.size()) < levels;
       module = module->m_parent)
    chain.push_back(module);
  std::string text;
  for (auto module = chain.rbegin(); module != chain.rend(); ++module) {
    if (!text.empty()) text += '\\';
    text += (*module)->m_name.GetString();
  }
  return text;
}

HString Module::getFullPathString() const { return HString("\\" + suffixText(INT32_MAX)); }

HString Module::getMinimumPathString(bool withinPriority) const {
  Module const* priority = withinPriority ? m_database->getPriorityModule() : nullptr;
  if (priority && priority != this && !isDescendedFrom(priority)) priority = nullptr;
  int const levels = m_database->getIndex().levelsToTell(this, priority);
  return levels == 0 ? getFullPathString() : HString(suffixText(levels));
}

// --- hierarchy ---

Module::Children& Module::children() {
  if (!m_children) m_children = std::make_unique<Children>();
  return *m_children;
}

int Module::getNumChildren() const { return m_children ? m_children->all.getCount() : 0; }

Module* Module::getChild(int i) const { return m_children ? m_children->all.at(i) : nullptr; }

int Module::getNumNodeChildren() const { return m_children ? m_children->nodes.getCount() : 0; }

Node* Module::getNodeChild(int i) const {
  return m_children ? static_cast<Node*>(m_children->nodes.at(i)) : nullptr;
}

int Module::getNumMarkerChildren() const { return m_children ? m_children->markers.getCount() : 0; }

Marker* Module::getMarkerChild(int i) const {
  return m_children ? static_cast<Marker*>(m_children->markers.at(i)) : nullptr;
}

int Module::findMarkerChild(HString const& name) const {
  int found = -1;
  auto const visit = [&](Module* child) {
    if (!child->isKindOf(&Marker::s_classMarker)) return true;
    int const index = m_children->markers.indexOf(child);
    if (found < 0 || index < found) found = index;
    return true;
  };
  if (m_children) m_database->getIndex().forEachChild(this, name.GetString(), visit);
  return found;
}

Node* Module::getNodeParent() const {
  Module* ancestor = m_parent;
  while (ancestor && !ancestor->isKindOf(&Node::s_classNode)) ancestor = ancestor->m_parent;
  return static_cast<Node*>(ancestor);
}

Character* Module::getCharacterParent() const {
  Module* ancestor = m_parent;
  while (ancestor && !ancestor->isKindOf(&Character::s_classCharacter)) ancestor = ancestor->m_parent;
  return static_cast<Character*>(ancestor);
}

bool Module::isDescendedFrom(Module const* ancestor) const {
  Module const* module = m_parent;
  while (module && module != ancestor) module = module->m_parent;
  return module != nullptr && ancestor != nullptr;
}

void Module::getModAndDecedents(TSimpleArray<Module*>& out) {
  std::vector<Module*> open{this};
  while (!open.empty()) {
    Module* next = open.back();
    open.pop_back();
    out.add(next);
    for (int i = next->getNumChildren(); i-- > 0;) open.push_back(next->getChild(i));
  }
}

bool Module::addChild(Module* child) {
  // A module without children has none below it, so that a chain grows at its end in constant time.
  bool const mayBeAbove = child && child->getNumChildren() > 0;
  if (!child || child == this || (mayBeAbove && isDescendedFrom(child)) || !isInScene() ||
      !m_database->contains(child) || child->isKindOf(&Character::s_classCharacter))
    return false;
  if (child->m_parent != this) child->storeParent(this);
  return true;
}

bool Module::removeChild(Module* child, bool) {
  if (!child || child->m_parent != this) return false;
  child->storeParent(nullptr);
  return true;
}

// --- attributes ---

Attribute* Module::getAttribute(char const* name) const {
  for (auto const& attribute : m_attributes)
    if (attribute->getName() == name) return attribute.get();
  return nullptr;
}

Attribute* Module::getAttribute(ControlID id) const {
  for (auto const& attribute : m_attributes)
    if (attribute->getID() == id) return attribute.get();
  return nullptr;
}

Attribute* Module::addAttribute(std::unique_ptr<Attribute> attribute, Attribute::Reaction reaction) {
  assert(attribute->m_custom || PropertyTable::isBuiltInAttribute(attribute->getName()));
  Attribute::Type const type = attribute->getType();
  attribute->m_module = this;
  attribute->m_id = ControlID(++m_database->m_lastID);
  attribute->m_reaction = reaction;
  attribute->m_canBeUnset = attribute->m_custom || type == Attribute::Color ||
                            type == Attribute::ModuleReference || type == Attribute::MultiModule;
  // What can be unset starts so; the others always are set.
  attribute->m_set = !attribute->m_canBeUnset;
  storeAttribute(std::move(attribute));
  return m_attributes.back().get();
}

Attribute* Module::addCustomAttribute(std::unique_ptr<Attribute> attribute) {
  HString const& name = attribute->getName();
  if (getAttribute(name.GetStr()) || !m_database->getPropertyTable().addAttribute(name)) return nullptr;
  attribute->m_custom = true;
  return addAttribute(std::move(attribute));
}

// --- channels ---

Controller* Module::getChannel(char const* name) const {
  return getProperty(m_database->getPropertyTable().findId(HString(name)));
}

Controller* Module::getChannel(ControlID id) const {
  for (auto const& channel : m_channels)
    if (channel->getID() == id) return channel.get();
  return nullptr;
}

Controller* Module::getProperty(unsigned id) const {
  id &= 0xffff;
  if (id == 0) return nullptr;
  for (auto const& channel : m_channels)
    if (channel->getPropertyId() == id) return channel.get();
  return nullptr;
}

// --- data ---

bool Module::hasKeysInClip(NLEClip const* clip, bool) const {
  return std::any_of(m_channels.begin(), m_channels.end(),
                     [&](auto const& channel) { return channel->hasKeysInClip(clip); });
}

// Channels make their tracks at the first key, so there is nothing to prepare.
void Module::addToClip(NLEClip*) {}

HTimeRange Module::getDataRange() const {
  HTimeRange range;
  NLEClip const* clip = m_database->getActiveClip();
  for (auto const& channel : m_channels) range.include(channel->getKeyRangeInClip(clip));
  return range;
}

void Module::beginDataEdit(HTimeRange const& range) {
  if (!m_dataEdit) {
    m_dataEdit = std::make_unique<OpenEdit>();
    for (auto const& channel : m_channels) m_dataEdit->before.push_back({channel.get(), channel->getState()});
  }
  ++m_dataEdit->depth;
  for (OpenEdit::Before const& before : m_dataEdit->before) before.channel->beginDataEdit(range);
}

void Module::endDataEdit() {
  if (!m_dataEdit) return;
  // Not the channels that were added meanwhile: their edit did not begin.
  for (OpenEdit::Before const& before : m_dataEdit->before) before.channel->endDataEdit();
  if (--m_dataEdit->depth == 0) m_dataEdit.reset();
}

void Module::discardDataEdit() {
  if (!m_dataEdit) return;
  for (OpenEdit::Before const& before : m_dataEdit->before) before.channel->restore(before.state);
  // Channels that were added meanwhile held no keys.
  for (size_t i = m_dataEdit->before.size(); i < m_channels.size(); ++i) {
    DataEdit const edit(*m_channels[i]);
    m_channels[i]->storeTracks({});
  }
  endDataEdit();
}

// --- state ---

namespace {

// The built-in switches stand at these places in every module.
enum { kVisible = 1, kLocked = 2 };

}  // namespace

bool Module::isVisible() const { return static_cast<BoolAttribute*>(getAttribute(kVisible))->getValue(); }

void Module::setVisible(bool visible, bool notify) {
  static_cast<BoolAttribute*>(getAttribute(kVisible))->setValue(visible, true, notify, true, true);
}

bool Module::isLocked() const { return static_cast<BoolAttribute*>(getAttribute(kLocked))->getValue(); }

void Module::setSelected(bool selected) {
  m_database->checkThread();
  if (!isInScene()) return;
  selected ? m_database->getSelection().add(this) : m_database->getSelection().remove(this);
}
