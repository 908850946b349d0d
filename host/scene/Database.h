// A scene: modules by path, index, identifier and selection; clips; active properties; scene-wide settings.
// All changes of membership, hierarchy and selection pass through it. It owns all that belongs to it: time,
// channel names, clipboard, undo, events. Commands reach the current scene of their thread through g_db
// (SceneScope.h); a module knows its own.
#pragma once

#include <atomic>
#include <memory>
#include <vector>

#include "host/base/ItemAt.h"
#include "host/base/Log.h"
#include "host/base/ThreadLocal.h"
#include "host/scene/Clips.h"
#include "host/scene/Selection.h"

class CalibrationMgr;
class ClipboardManager;
class HTimeManager;
class PropertyTable;
class MotionScope;
struct SceneAside;
class SceneIndex;
class SubjectManager;
struct SceneServices;

class Database;

// The current scene of the thread; null on a thread that has none.
extern TALIX_THREAD_LOCAL Database* g_db;

class Database {
 public:
  Database();
  ~Database();
  Database(Database const&) = delete;
  Database& operator=(Database const&) = delete;

  // What g_db points at. Throws std::logic_error when the thread has no scene.
  static Database& current();

  // An empty scene, with a new time manager's settings and the built-in channels only.
  void newScene();

  // --- modules ---
  // A
  // module of a class, with a name that its siblings do not have ("a", then "a_1"; empty: the class name), in
  // the scene. The first clip becomes active. Null for an abstract class or one that is no module class, a
  // name that cannot stand, a 32nd clip, a second module of a single-instance class, a parent that refuses.
  Module* createModule(HRuntimeClass* type, char const* name, Module* parent);
  // Puts a module that createInstance made for this scene into it; the scene owns it from then on.
  // `uniqueName`: it gets a name that its siblings do not have. `character` (may be null) becomes its parent.
  // select: it becomes selected. False, and the caller keeps the module, when createModule would refuse.
  bool addToScene(Module* module, bool uniqueName, Character const* character, bool select, bool notify);
  // Takes the module and all below it out of the scene, with every reference to them. It lives on until
  // releaseRemoved. False when it is not in the scene. The flags are the host's and do nothing: children go
  // with it, it is deselected, and an open undo step records it.
  bool removeFromScene(Module* module, bool children, bool deselect, bool undoable, bool notify);
  // Copies the selected modules with all that they hold, clips with their keys on every module; children only
  // when they are selected. A copy stands below the copy of its original's parent when there is one, else
  // below that parent itself, under a name that its siblings do not have. The copies become the selection.
  // One that would pass a limit of the scene is left out with a warning.
  void duplicateSelectedObjects();
  // Destroys what was removed since; whoever runs commands calls it after each line.
  void releaseRemoved();

  // Whether the module stands in this scene.
  bool contains(Module const* module) const { return module->isInScene() && module->getDatabase() == this; }
  int getNumModules() const { return m_modules.getCount(); }
  Module* getModule(int i) const { return m_modules.at(i); }  // in order of creation
  Module* getModule(ControlID& id) const;
  Module* getModule(HString& path) const { return getModuleWithPath(path, nullptr, false); }
  // The module that a full path or a suffix of one names, among those of a class (null: any). A suffix that
  // fits several names the one below the priority module, if that is one. priorityOnly: only the priority
  // module's tree is searched, or everything when there is none.
  Module* getModuleWithPath(HString const& path, HRuntimeClass const* filter, bool priorityOnly) const;
  int getNumNodes() const { return m_nodes.getCount(); }
  Node* getNode(int i) const { return m_nodes.at(i); }
  TSimpleArray<Marker*> getMarkers() const;
  TSimpleArray<Module*> getModulesOfType(HRuntimeClass const* type) const;  // and of its subclasses
  bool moduleOfTypeExists(HRuntimeClass const* type) const;
  SceneIndex& getIndex() const { return *m_index; }

  // --- selection ---
  Module* getPrimarySelectedModule() const { return m_selection.getPrimary(); }
  bool setPrimarySelectedModule(
      Module* module);  // selects it when need be; null: none. False: not in the scene
  int getNumSelectedModules() const { return m_selection.getCount(); }
  Module* getSelectedModule(int i) const { return m_selection.at(i); }
  int getNumSelectedNodes() const { return m_selection.getNumNodes(); }
  Node* getSelectedNode(int i) const { return m_selection.getNode(i); }
  int getNumSelectedMarkers() const { return m_selection.getNumMarkers(); }
  Marker* getSelectedMarker(int i) const { return m_selection.getMarker(i); }
  LabelingBone* getSelectedLabelingBone(int i) const { return m_selection.getLabelingBone(i); }
  void selectAllModules(bool select);
  Selection& getSelection() { return m_selection; }

  // --- priority ---
  Module* getPriorityModule() const { return m_priority; }
  // Null: none. A module that is not in the scene is not taken.
  void setPrioritySearchModule(Module* module) {
    if (!module || contains(module)) m_priority = module;
  }

  // --- clips and layers ---
  int getNumClips() const { return m_clips.getCount(); }
  NLEClip* getHeadClip() const { return m_clips.getCount() ? m_clips.at(0) : nullptr; }
  NLEClip* getClipAfter(NLEClip const* clip) const;
  NLEClip* getActiveClip() const { return m_activeClip; }  // null: the base clip
  // Its lowest layer becomes active. A clip that is not in the scene is not taken.
  void setActiveClip(NLEClip* clip);
  int getActiveLayer() const { return m_activeClip ? m_activeLayer : -1; }
  bool setActiveLayer(int layer);  // false: the active clip has no such layer

  // --- active properties: channels, or components of channels, that key commands work on ---
  int getNumActiveProperties() const { return static_cast<int>(m_activeProperties.size()); }
  // A property id with its component bits (PropertyTable).
  unsigned int getActiveProperty(int i) const { return itemAt(m_activeProperties, i); }  // 0 beyond them
  void setActiveProperties(std::vector<unsigned> ids);
  // Whether active properties follow what is keyed; off at start.
  bool getAutoUpdateProperties() const { return m_autoUpdateProperties; }
  void setAutoUpdateProperties(bool on) { m_autoUpdateProperties = on; }
  // Drops active properties that no module has any more. notify does nothing.
  void syncActiveProperties(bool notify);

  // --- settings ---
  static bool isDevOnlyMode();
  static void setDevOnlyMode(bool on);
  bool getUpdateSolversBeforeClips() const { return m_solversBeforeClips; }
  void setUpdateSolversBeforeClips(bool on);
  // Red, green and blue, 0 to 255.
  static Vec3 const& getDefaultModColor();
  static Vec3 const& getPrimSelModColor();
  static Vec3 const& getSelModColor();
  // The axis that points up: 0 x, 1 y, 2 z; -1 until a take or the user sets it.
  int getUpAxis() const { return m_upAxis; }
  void setUpAxis(int axis);
  // For mutators of what the journal keeps together: active clip, layer and properties, up axis, frame
  // rate and ranges.
  void recordSettings();

  UndoJournal& getUndoJournal() { return m_journal; }
  // For steps that are discarded: what of the scene they do not tell of.
  void putAside(SceneAside& aside) const;
  void putBack(SceneAside& aside) noexcept;
  // Puts lists in order again after undo and redo, and forgets what was cached.
  void restoreOrder();
  // Forgets every cached world transform: what is active has changed.
  void forgetWorldCache() { ++m_worldCache.epoch; }
  // Whoever changes the scene or what it caches asks this first. Throws std::logic_error when this thread
  // does not hold the scene.
  void checkThread() const {
    if (m_holder.load(std::memory_order_relaxed) != &g_db) [[unlikely]]
      refuseThread();
  }

  HTimeManager* getTimeManager() const { return m_time.get(); }
  PropertyTable& getPropertyTable() const { return *m_properties; }
  SceneServices& getServices() const { return *m_services; }
  // For keeping the motion of several nodes at once; null: none.
  MotionScope* getMotionScope() const { return m_motionScope; }
  void setMotionScope(MotionScope* scope) { m_motionScope = scope; }

  CalibrationMgr* getCalibrationMgr() const { return m_calibration.get(); }
  ClipboardManager* getClipboardManager() const { return m_clipboard.get(); }
  SubjectManager* getSubjectManager() const { return m_subjects.get(); }

  void logError(char const* format, ...) TALIX_PRINTF(2, 3);
  void logWarning(char const* format, ...) TALIX_PRINTF(2, 3);
  void logInfo(char const* format, ...) TALIX_PRINTF(2, 3);

 private:
  friend struct DefaultScene;
  // services: those of the default scene; null: its own.
  explicit Database(SceneServices* services);

  friend class Module;
  friend class Node;
  friend class SceneScope;

  void hold();
  void release();
  static void makeCurrent(Database* scene);  // null: none
  [[noreturn]] void refuseThread() const;

  void needsSorting(Module* parent) { m_unsortedParents.push_back(parent); }
  bool mayJoin(Module const* module) const;
  // Mutators of membership: put a set-up module with its name and parent into the scene, and take it out.
  void add(std::unique_ptr<Module> module);
  void remove(Module* module);
  void storeActive(NLEClip* clip, int layer);  // mutator
  struct Membership;
  struct SettingsChange;
  // Puts a module into every list and index, by its order of creation; on an exception nothing has changed.
  void index(Module* module);
  void unindex(Module* module) noexcept;
  void takeFromLists(Module* module) noexcept;
  void removeAll();

  OrderedList<Module, &Module::m_sceneSlot> m_modules;
  OrderedList<Node, &Node::m_nodeSlot> m_nodes;
  OrderedList<NLEClip, &NLEClip::m_clipSlot> m_clips;
  std::unordered_map<ControlID, Module*> m_byId;
  std::unordered_map<HRuntimeClass const*, int> m_countByClass;
  std::unique_ptr<SceneIndex> m_index;
  std::vector<std::unique_ptr<Module>> m_removed;
  bool m_unsorted = false;  // lists in order of creation
  std::vector<Module*> m_unsortedParents;
  UndoJournal m_journal{*this};
  uint64 m_created = 0;  // counts modules
  uint64 m_linked = 0;   // and children
  uint64 m_lastID = 0;
  Selection m_selection{m_journal};
  Module* m_priority = nullptr;
  NLEClip* m_activeClip = nullptr;
  int m_activeLayer = 0;
  std::vector<unsigned> m_activeProperties;
  bool m_autoUpdateProperties = false;
  bool m_solversBeforeClips = false;
  int m_upAxis = -1;
  uint64 m_undoMark = 0;

  // World transforms are cached for one time, that of the last question: the current time when a scene is
  // looked at, each frame in turn when something walks through time. A node's holds while its epoch
  // is the cache's. A node that holds has ancestors that hold.
  struct WorldCache {
    int64 time = 0;
    uint64 epoch = 1;
  } m_worldCache;

  std::atomic<void const*> m_holder = nullptr;  // tells the thread that holds the scene
  int m_holds = 0;                              // scopes of that thread

  std::unique_ptr<SceneServices> m_ownServices;  // null: the default scene, which has the default ones
  SceneServices* m_services;
  std::unique_ptr<HTimeManager> m_time;
  std::unique_ptr<PropertyTable> m_properties;
  MotionScope* m_motionScope = nullptr;
  std::unique_ptr<CalibrationMgr> m_calibration;
  std::unique_ptr<ClipboardManager> m_clipboard;
  std::unique_ptr<SubjectManager> m_subjects;
};

inline UndoJournal& Module::journal() const { return m_database->m_journal; }

inline bool Module::isRecorded() const {
  m_database->checkThread();
  return journal().isRecording() && m_enteredStep != journal().getStep() && (isInScene() || m_undoHolds > 0);
}

inline Database* Controller::getDatabase() const {
  return m_module ? m_module->getDatabase() : &Database::current();
}
