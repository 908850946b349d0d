// The mutators of the scene itself: what modules it has, what is active.
#include <algorithm>

#include "host/scene/CalibrationMgr.h"
#include "host/scene/ChangeSetBuilder.h"
#include "host/scene/Database.h"
#include "host/scene/HTimeManager.h"
#include "host/scene/PropertyTable.h"
#include "host/scene/SceneAside.h"
#include "host/scene/SceneIndex.h"
#include "host/scene/SubjectManager.h"

// --- membership ---

// A module came into the scene or left it; it keeps its parent, its children and its place among all.
struct Database::Membership : UndoChange {
  explicit Membership(Module& concerned)
      : UndoChange(&concerned), module(concerned), inScene(concerned.isInScene()) {}
  void swap() override {
    bool const now = module.isInScene();
    Database& scene = *module.getDatabase();
    if (now != inScene) inScene ? scene.index(&module) : scene.unindex(&module);
    inScene = now;
  }
  int64 memoryUse() const override { return sizeof *this + module.memoryUse(); }
  void tell(ChangeSetBuilder& changes) const override { changes.tellMembership(module, inScene); }

  Module& module;
  bool inScene;
};

void Database::add(std::unique_ptr<Module> owned) {
  Module* module = owned.get();
  if (m_journal.isRecording()) {
    auto change = std::make_unique<Membership>(*module);
    owned.release();  // the change destroys a module that is not in the scene
    m_journal.add(std::move(change));
    module->m_enteredStep = m_journal.getStep();
  }
  module->m_order = ++m_created;
  index(module);
  owned.release();
  if (auto* clip = objectAs<NLEClip>(module); clip && getNumClips() == 1) setActiveClip(clip);
}

void Database::index(Module* module) {
  if (getNumModules() > 0 && getModule(getNumModules() - 1)->m_order > module->m_order) m_unsorted = true;
  int& count = m_countByClass[module->getRuntimeClass()];
  try {
    m_modules.append(module);
    m_byId.emplace(module->getID(), module);
    m_index->add(module);
    if (auto* node = objectAs<Node>(module)) m_nodes.append(node);
    if (auto* character = objectAs<Character>(module)) m_subjects->m_subjects.append(character);
    if (auto* clip = objectAs<NLEClip>(module)) m_clips.append(clip);
    module->linkToParent();
  } catch (...) {
    takeFromLists(module);
    throw;
  }
  ++count;
}

void Database::remove(Module* module) {
  m_selection.remove(module);
  module->forgetByAll();
  if (auto* clip = objectAs<NLEClip>(module)) {
    if (m_activeClip == clip) setActiveClip(nullptr);
    for (Module* other : m_modules.toVector())
      for (int i = 0; i < other->getNumChannels(); ++i) other->getChannel(i)->forgetClip(clip);
  }
  if (m_journal.isRecording()) m_journal.add(std::make_unique<Membership>(*module));
  unindex(module);
}

void Database::unindex(Module* module) noexcept {
  if (m_priority == module) m_priority = nullptr;
  --m_countByClass.find(module->getRuntimeClass())->second;
  takeFromLists(module);
  m_index->forgetParent(module);
}

void Database::takeFromLists(Module* module) noexcept {
  module->unlinkFromParent();
  if (auto* node = objectAs<Node>(module)) m_nodes.remove(node);
  if (auto* character = objectAs<Character>(module)) m_subjects->m_subjects.remove(character);
  if (auto* clip = objectAs<NLEClip>(module)) m_clips.remove(clip);
  m_index->remove(module);
  m_byId.erase(module->getID());
  m_modules.remove(module);
}

bool Database::removeFromScene(Module* module, bool, bool, bool, bool) {
  checkThread();
  if (!module || !contains(module)) return false;
  TSimpleArray<Module*> all(64, 4096);
  module->getModAndDecedents(all);
  if (module->getParent()) module->storeParent(nullptr);
  m_removed.reserve(m_removed.size() + static_cast<size_t>(all.getCount()));
  // Children first, so that a module never outlives its parent in the scene.
  for (int i = all.getCount() - 1; i >= 0; --i) {
    remove(all[i]);
    // What the journal tells of is the journal's to destroy.
    if (all[i]->m_undoHolds == 0) m_removed.emplace_back(all[i]);
  }
  return true;
}

// --- what is active ---

// The frame rate and the ranges are among it. Small, and changed together as often as not.
struct Database::SettingsChange : UndoChange {
  explicit SettingsChange(Database& concerned)
      : UndoChange(nullptr),
        scene(concerned),
        clip(scene.m_activeClip),
        layer(scene.m_activeLayer),
        upAxis(scene.m_upAxis),
        solversBeforeClips(scene.m_solversBeforeClips),
        properties(scene.m_activeProperties),
        time(scene.m_time->getSettings()) {}
  void swap() override {
    std::swap(clip, scene.m_activeClip);
    std::swap(layer, scene.m_activeLayer);
    std::swap(upAxis, scene.m_upAxis);
    std::swap(solversBeforeClips, scene.m_solversBeforeClips);
    std::swap(properties, scene.m_activeProperties);
    scene.m_time->swapSettings(time);
  }
  bool isVoid() const override {
    return clip == scene.m_activeClip && layer == scene.m_activeLayer && upAxis == scene.m_upAxis &&
           solversBeforeClips == scene.m_solversBeforeClips && properties == scene.m_activeProperties &&
           time == scene.m_time->getSettings();
  }
  int64 memoryUse() const override {
    return static_cast<int64>(sizeof *this +
                              sizeof(unsigned) * (properties.size() + scene.m_activeProperties.size()));
  }

  void tell(ChangeSetBuilder& changes) const override {
    auto const setting = [&](char const* name, std::string const& before, std::string const& after) {
      changes.tell(SceneChange::Kind::attribute, nullptr, name, before, after);
    };
    auto const names = [this](std::vector<unsigned> const& ids) {
      std::string text;
      for (unsigned const id : ids)
        text += (text.empty() ? "" : " ") + scene.getPropertyTable().getName(id).GetString() +
                textOfBits(id >> 28 & 7);
      return text;
    };
    changes.tell(SceneChange::Kind::attribute, nullptr, "ActiveClip", textOf(clip),
                 textOf(scene.m_activeClip), clip != scene.m_activeClip);
    setting("ActiveLayer", std::to_string(clip ? layer : -1), std::to_string(scene.getActiveLayer()));
    setting("ActiveProperties", names(properties), names(scene.m_activeProperties));
    setting("SolversBeforeClips", solversBeforeClips ? "true" : "false",
            scene.m_solversBeforeClips ? "true" : "false");
    setting("UpAxis", std::to_string(upAxis), std::to_string(scene.m_upAxis));
    HTimeManager::Settings const now = scene.m_time->getSettings();
    setting("FrameRate", textOf(time.rate.getFrameRate()), textOf(now.rate.getFrameRate()));
    setting("AnimRange", textOfRange(time.animRange), textOfRange(now.animRange));
    setting("PlayRange", textOfRange(time.playRange), textOfRange(now.playRange));
    auto const ranges = [](std::vector<HTimeRange> const& all) {
      std::string text;
      for (HTimeRange const& range : all) text += (text.empty() ? "" : " ") + textOfRange(range);
      return text;
    };
    setting("SelectedRanges", ranges(time.selected), ranges(now.selected));
  }
  static std::string textOfRange(HTimeRange const& range) {
    return std::to_string(range.getStart()) + " " + std::to_string(range.getEnd());
  }
  static std::string textOfBits(unsigned bits) {
    std::string text = bits == 0 || bits == 7 ? "" : ".";
    for (int c = 0; c < 3 && !text.empty(); ++c)
      if (bits >> c & 1) text += "xyz"[c];
    return text;
  }

  Database& scene;
  NLEClip* clip;
  int layer;
  int upAxis;
  bool solversBeforeClips;
  std::vector<unsigned> properties;
  HTimeManager::Settings time;
};

void Database::setUpdateSolversBeforeClips(bool on) {
  recordSettings();
  m_solversBeforeClips = on;
}

void Database::recordSettings() {
  checkThread();
  m_journal.addOnce<SettingsChange>(m_undoMark, *this);
}

void Database::storeActive(NLEClip* clip, int layer) {
  recordSettings();
  bool const switched = clip != m_activeClip;
  m_activeClip = clip;
  m_activeLayer = layer;
  if (switched) forgetWorldCache();
}

void Database::setActiveProperties(std::vector<unsigned> ids) {
  recordSettings();
  m_activeProperties = std::move(ids);
}

void Database::setUpAxis(int axis) {
  recordSettings();
  m_upAxis = axis;
}

// --- what a discarded step brings back beside its changes ---

void Database::putAside(SceneAside& aside) const { aside = {m_time->getTime(), m_priority, *m_clipboard}; }

void Database::putBack(SceneAside& aside) noexcept {
  m_time->setTime(aside.time, true);
  m_priority = aside.priority;
  std::swap(*m_clipboard, aside.clipboard);
}

// --- after undo and redo ---

void Database::restoreOrder() {
  if (m_unsorted) {
    auto const earlier = [](Module const* a, Module const* b) { return a->m_order < b->m_order; };
    m_modules.sort(earlier);
    m_nodes.sort(earlier);
    m_clips.sort(earlier);
    m_subjects->m_subjects.sort(earlier);
    m_unsorted = false;
  }
  std::sort(m_unsortedParents.begin(), m_unsortedParents.end());
  m_unsortedParents.erase(std::unique(m_unsortedParents.begin(), m_unsortedParents.end()),
                          m_unsortedParents.end());
  for (Module* parent : m_unsortedParents) parent->sortChildren();
  m_unsortedParents.clear();
  m_selection.restoreOrder();
  forgetWorldCache();
}
