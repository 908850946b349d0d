// Copies of the selected modules. A copy is made by the same operations as any new module and then takes what
// the original has: attributes, channels with the keys of all clips, pre-transform, lines.
//
// Relations inside the selection (parents, references, lines) become relations of the copies; those to
// modules outside stay as they are. Key selection is part of the keys and is copied with them. A camera's
// copy is another device and takes a free number. A clip's copy holds copies of all its keys.

#include <optional>
#include <unordered_map>
#include <unordered_set>

#include "host/scene/CalibrationMgr.h"
#include "host/scene/DataEdit.h"
#include "host/scene/Database.h"
#include "host/scene/Devices.h"

namespace {

class Duplication {
 public:
  Duplication(Database& scene, std::vector<Module*> originals)
      : m_scene(scene),
        m_originals(std::move(originals)),
        m_waiting(m_originals.begin(), m_originals.end()) {}

  // The copies in the order of their originals.
  std::vector<Module*> make();
  // Null for a module that was not copied.
  Module* copyOf(Module const* original) const {
    auto const found = m_copies.find(original);
    return found == m_copies.end() ? nullptr : found->second;
  }

 private:
  void makeWithParents(Module* original);
  void makeOne(Module* original);
  // The copy of a module that was copied, else the module itself.
  Module* counterpart(Module* module) const {
    Module* copy = copyOf(module);
    return copy ? copy : module;
  }
  Attribute::Value counterparts(Attribute::Value value) const;
  void copyAttributes(Module const& original, Module& copy) const;
  void copyNode(Node const& original, Node& copy) const;
  void copyClipKeys() const;

  Database& m_scene;
  std::vector<Module*> m_originals;
  std::unordered_set<Module const*> m_waiting;  // those whose copy was not tried yet
  std::unordered_map<Module const*, Module*> m_copies;
  std::optional<FreeDeviceNumbers> m_deviceNumbers;
};

// --- modules and their places ---

// Parents come before their children, in whatever order they were selected.
void Duplication::makeWithParents(Module* original) {
  std::vector<Module*> chain;
  for (Module* module = original; module && m_waiting.contains(module); module = module->getParent())
    chain.push_back(module);
  for (auto module = chain.rbegin(); module != chain.rend(); ++module) makeOne(*module);
}

void Duplication::makeOne(Module* original) {
  m_waiting.erase(original);
  HRuntimeClass* type = original->getRuntimeClass();
  Module* copy = m_scene.createModule(type, original->getName().GetStr(), counterpart(original->getParent()));
  if (copy) {
    m_copies.emplace(original, copy);
    return;
  }
  std::string const limit = type->isSingleInstance() ? std::string("one ") + type->getName()
                                                     : std::to_string(NLEClip::kMaximum) + " clips";
  writeLog(LogLevel::Warning, original->getMinimumPathString(false).GetString() +
                                  " was not duplicated: a scene holds at most " + limit);
}

// --- attributes ---

Attribute::Value Duplication::counterparts(Attribute::Value value) const {
  if (auto* module = std::get_if<Module*>(&value)) *module = counterpart(*module);
  if (auto* modules = std::get_if<Attribute::Modules>(&value))
    for (Module*& module : *modules) module = counterpart(module);
  return value;
}

// A custom attribute like another one, without its value.
std::unique_ptr<Attribute> sameKind(Attribute const& attribute) {
  Attribute::Labels labels;
  if (auto const* enumeration = objectAs<EnumAttribute>(&attribute)) labels = enumeration->getLabels();
  if (auto const* bits = objectAs<BitFieldAttribute>(&attribute)) labels = bits->getLabels();
  return Attribute::create(attribute.getType(), attribute.getName(), labels);
}

void Duplication::copyAttributes(Module const& original, Module& copy) const {
  for (int i = 0; i < original.getNumAttributes(); ++i) {
    Attribute const& attribute = *original.getAttribute(i);
    if (attribute.isKindOf(&NameAttribute::s_classNameAttribute)) continue;
    // Modules of one class have the same built-in attributes, before all others.
    Attribute* own =
        attribute.isCustom() ? copy.addCustomAttribute(sameKind(attribute)) : copy.getAttribute(i);
    if (attribute.isCustom()) {
      own->store(attribute.getRawDefault(), false, false);
      own->takeAsDefault();
    }
    // Nothing reacts: what hangs on the values is copied itself.
    own->store(counterparts(attribute.getRawValue()), attribute.isSet(), false);
  }
}

// --- channels ---

// In every clip and layer. A copy of a track shares its keys until one of the two is changed.
void copyKeys(Controller const& from, NLEClip const* fromClip, Controller& to, NLEClip* toClip) {
  for (int layer = 0; layer < fromClip->getNumLayers(); ++layer)
    if (KeyTrack const* track = from.findTrack(fromClip, layer)) to.setTrack(toClip, layer, *track);
}

void copyChannels(Module const& original, Module& copy) {
  for (int i = 0; i < original.getNumChannels(); ++i) {
    Controller const& channel = *original.getChannel(i);
    Controller* own = copy.addChannel(channel.getName(), channel.getPropertyType());
    own->setDefaultValues(channel.getDefaultValues());
    own->setInterpType(static_cast<int>(channel.getInterpolation()));
    own->setLocked(channel.isLocked());
    DataEdit const edit(*own);
    for (NLEClip* clip = own->getDatabase()->getHeadClip(); clip; clip = clip->getNext())
      copyKeys(channel, clip, *own, clip);
  }
}

// --- what kinds of modules have besides ---

void Duplication::copyNode(Node const& original, Node& copy) const {
  copy.setPreRotation(original.getPreRotation(), false);
  copy.setPreTranslation(original.getPreTranslation());
  for (int i = 0; i < original.getNumConnectingLines(); ++i) {
    MarkerConnection const line = original.getConnectingLine(i);
    MarkerConnection own(static_cast<Node*>(counterpart(line.getTarget())));
    own.setConnectingColor(line.getConnectingColor());
    copy.addConnectingLine(own);
  }
}

void copyClip(NLEClip const& original, NLEClip& copy) {
  if (auto const* clip = objectAs<Clip>(&original)) static_cast<Clip&>(copy).setFileTime(clip->getFileTime());
  while (copy.getNumLayers() < original.getNumLayers()) copy.addLayer();
  for (int layer = 0; layer < original.getNumLayers(); ++layer)
    copy.setLayerLocked(layer, original.isLayerLocked(layer));
}

// The copies of clips hold what the clips hold, on every module of the scene.
void Duplication::copyClipKeys() const {
  std::vector<std::pair<NLEClip*, NLEClip*>> clips;
  for (Module* original : m_originals) {
    auto* clip = objectAs<NLEClip>(original);
    if (Module* copy = copyOf(original); clip && copy) clips.emplace_back(clip, static_cast<NLEClip*>(copy));
  }
  for (int i = 0; !clips.empty() && i < m_scene.getNumModules(); ++i) {
    Module* module = m_scene.getModule(i);
    for (int k = 0; k < module->getNumChannels(); ++k) {
      Controller* channel = module->getChannel(k);
      DataEdit const edit(*channel);
      for (auto const& [clip, copy] : clips) copyKeys(*channel, clip, *channel, copy);
    }
  }
}

std::vector<Module*> Duplication::make() {
  for (Module* original : m_originals) makeWithParents(original);
  std::vector<Module*> made;
  for (Module* original : m_originals) {
    Module* copy = copyOf(original);
    if (!copy) continue;
    made.push_back(copy);
    copyAttributes(*original, *copy);
    copyChannels(*original, *copy);
    if (auto* node = objectAs<Node>(original)) copyNode(*node, *static_cast<Node*>(copy));
    if (auto* clip = objectAs<NLEClip>(original)) copyClip(*clip, *static_cast<NLEClip*>(copy));
    if (auto* camera = objectAs<OpticalCamera>(copy); camera && camera->getDeviceID() != 0) {
      if (!m_deviceNumbers) m_deviceNumbers.emplace(m_scene);
      camera->setDeviceID(m_deviceNumbers->take());
    }
  }
  copyClipKeys();
  return made;
}

}  // namespace

void Database::duplicateSelectedObjects() {
  std::vector<Module*> originals;
  for (int i = 0; i < getNumSelectedModules(); ++i) originals.push_back(getSelectedModule(i));
  Module const* primary = getPrimarySelectedModule();
  Duplication duplication(*this, std::move(originals));
  std::vector<Module*> const copies = duplication.make();
  if (copies.empty()) return;
  m_selection.clear();
  for (Module* copy : copies) copy->setSelected(true);
  if (Module* copy = duplication.copyOf(primary)) setPrimarySelectedModule(copy);
}
