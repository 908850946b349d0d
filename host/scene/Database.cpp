#include "host/scene/Database.h"

#include <cstdarg>

#include "host/base/Text.h"
#include "host/scene/CalibrationMgr.h"
#include "host/scene/ClipboardManager.h"
#include "host/scene/HTimeManager.h"
#include "host/scene/PropertyTable.h"
#include "host/scene/SceneIndex.h"
#include "host/scene/SubjectManager.h"
#include "host/services/SceneServices.h"

TALIX_THREAD_LOCAL Database* g_db = nullptr;

// Held from the start by the thread that loads the engine, which is the one that runs main.
struct DefaultScene {
  DefaultScene() : database(&SceneServices::getDefault()) {
    database.hold();
    Database::makeCurrent(&database);
  }

  Database database;
};

namespace {

DefaultScene s_default;
std::atomic<bool> s_devOnlyMode = false;

}  // namespace

Database::Database() : Database(nullptr) {}

Database::Database(SceneServices* services)
    : m_index(std::make_unique<SceneIndex>()),
      m_ownServices(services ? nullptr : std::make_unique<SceneServices>()),
      m_services(services ? services : m_ownServices.get()),
      m_time(std::make_unique<HTimeManager>(this)),
      m_properties(std::make_unique<PropertyTable>(m_journal)),
      m_calibration(std::make_unique<CalibrationMgr>(*this)),
      m_clipboard(std::make_unique<ClipboardManager>()),
      m_subjects(std::make_unique<SubjectManager>(*this)) {}

Database::~Database() {
  // Whoever ends it, no one works on it any more.
  m_holder = &g_db;
  Database* former = g_db == this ? nullptr : g_db;
  makeCurrent(this);
  removeAll();
  makeCurrent(former);
}

void Database::removeAll() {
  m_journal.clear();
  for (Module* module : m_modules.toVector())
    if (!module->getParent()) removeFromScene(module, true, true, false, true);
  releaseRemoved();
}

void Database::newScene() {
  checkThread();
  removeAll();
  m_activeProperties.clear();
  m_autoUpdateProperties = false;
  m_solversBeforeClips = false;
  m_upAxis = -1;
  m_created = 0;
  *m_index = SceneIndex();
  *m_clipboard = ClipboardManager();
  m_properties->reset();
  m_time->reset();
}

// --- modules ---

bool Database::mayJoin(Module const* module) const {
  HRuntimeClass const* type = module->getRuntimeClass();
  if (type->isDerivedFrom(&NLEClip::s_classNLEClip) && getNumClips() >= NLEClip::kMaximum) return false;
  return !type->isSingleInstance() || !moduleOfTypeExists(type);
}

Module* Database::createModule(HRuntimeClass* type, char const* name, Module* parent) {
  if (!type || !type->isDerivedFrom(&Module::s_classModule) || !type->getCreateFunction()) return nullptr;
  checkThread();
  HString const wanted = name && *name ? name : type->getName();
  if (!Module::isValidName(wanted) || (parent && !contains(parent))) return nullptr;
  if (parent && type->isDerivedFrom(&Character::s_classCharacter)) return nullptr;
  std::unique_ptr<Module> module(static_cast<Module*>(type->getCreateFunction()()));
  if (!mayJoin(module.get())) return nullptr;
  module->m_database = this;
  module->setUp();
  module->m_name = m_index->freeName(parent, wanted);
  Module* created = module.get();
  add(std::move(module));
  if (parent) created->storeParent(parent);
  return created;
}

bool Database::addToScene(Module* module, bool uniqueName, Character const* character, bool select, bool) {
  checkThread();
  if (!module || module->isInScene() || module->m_database != this || !mayJoin(module) ||
      (character && !contains(character)))
    return false;
  if (character && module->isKindOf(&Character::s_classCharacter)) return false;
  if (module->m_name.IsEmpty()) module->m_name = module->getRuntimeClass()->getName();
  auto* parent = const_cast<Character*>(character);
  if (uniqueName) module->m_name = m_index->freeName(parent, module->m_name);
  add(std::unique_ptr<Module>(module));
  if (parent) module->storeParent(parent);
  if (select) module->setSelected(true);
  return true;
}

void Database::releaseRemoved() { m_removed.clear(); }

Module* Database::getModule(ControlID& id) const {
  auto const found = m_byId.find(id);
  return found == m_byId.end() ? nullptr : found->second;
}

Module* Database::getModuleWithPath(HString const& path, HRuntimeClass const* filter,
                                    bool priorityOnly) const {
  Module const* below = priorityOnly ? m_priority : nullptr;
  std::string const& text = path.GetString();
  if (text.empty()) return nullptr;
  if (text.front() == '\\') return m_index->findFull(text, filter, below);
  Module* found = m_index->findSuffix(text, filter, below);
  return found || !m_priority || below ? found : m_index->findSuffix(text, filter, m_priority);
}

TSimpleArray<Marker*> Database::getMarkers() const {
  TSimpleArray<Marker*> markers(16, 4096);
  for (int i = 0; i < getNumNodes(); ++i)
    if (auto* marker = objectAs<Marker>(getNode(i))) markers.add(marker);
  return markers;
}

TSimpleArray<Module*> Database::getModulesOfType(HRuntimeClass const* type) const {
  TSimpleArray<Module*> modules(16, 4096);
  for (int i = 0; i < getNumModules(); ++i)
    if (getModule(i)->isKindOf(type)) modules.add(getModule(i));
  return modules;
}

bool Database::moduleOfTypeExists(HRuntimeClass const* type) const {
  for (auto const& [known, count] : m_countByClass)
    if (count > 0 && known->isDerivedFrom(type)) return true;
  return false;
}

// --- selection ---

bool Database::setPrimarySelectedModule(Module* module) {
  checkThread();
  if (module && !contains(module)) return false;
  m_selection.setPrimary(module);
  return true;
}

void Database::selectAllModules(bool select) {
  checkThread();
  if (!select) return m_selection.clear();
  for (int i = 0; i < getNumModules(); ++i) m_selection.add(getModule(i));
}

// --- clips and layers ---

NLEClip* Database::getClipAfter(NLEClip const* clip) const {
  if (!contains(clip)) return nullptr;
  int const next = m_clips.indexOf(clip) + 1;
  return next < getNumClips() ? m_clips.at(next) : nullptr;
}

void Database::setActiveClip(NLEClip* clip) {
  if (!clip || contains(clip)) storeActive(clip, 0);
}

bool Database::setActiveLayer(int layer) {
  if (!m_activeClip || layer < 0 || layer >= m_activeClip->getNumLayers()) return false;
  storeActive(m_activeClip, layer);
  return true;
}

// --- active properties ---

void Database::syncActiveProperties(bool) {
  std::vector<bool> held(PropertyTable::kIdMask + 1);
  for (int i = 0; i < getNumModules(); ++i)
    for (int k = 0; k < getModule(i)->getNumChannels(); ++k)
      held[getModule(i)->getChannel(k)->getPropertyId()] = true;
  std::vector<unsigned> kept;
  for (unsigned const id : m_activeProperties)
    if (held[id & PropertyTable::kIdMask]) kept.push_back(id);
  setActiveProperties(std::move(kept));
}

// --- settings ---

bool Database::isDevOnlyMode() { return s_devOnlyMode; }

void Database::setDevOnlyMode(bool on) { s_devOnlyMode = on; }

Vec3 const& Database::getDefaultModColor() {
  static constexpr Vec3 grey(160, 160, 160);
  return grey;
}

Vec3 const& Database::getPrimSelModColor() {
  static constexpr Vec3 green(64, 255, 64);
  return green;
}

Vec3 const& Database::getSelModColor() {
  static constexpr Vec3 white(255, 255, 255);
  return white;
}

void Database::logError(char const* format, ...) {
  va_list args;
  va_start(args, format);
  writeLog(LogLevel::Error, formatted(format, args));
  va_end(args);
}

void Database::logWarning(char const* format, ...) {
  va_list args;
  va_start(args, format);
  writeLog(LogLevel::Warning, formatted(format, args));
  va_end(args);
}

void Database::logInfo(char const* format, ...) {
  va_list args;
  va_start(args, format);
  writeLog(LogLevel::Info, formatted(format, args));
  va_end(args);
}
