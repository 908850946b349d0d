// A scene object: name and paths, parent and children, attributes, channels.
//
// The Database owns modules; a module owns its channels and attributes; parent and child links do not own.
// Names are not empty and hold no backslash; siblings may share one.
#pragma once

#include <memory>
#include <string>
#include <unordered_map>
#include <vector>

#include "host/base/ItemAt.h"
#include "host/base/TArray.h"
#include "host/base/TSimpleArray.h"
#include "host/scene/Attribute.h"
#include "host/scene/ControllerKinds.h"
#include "host/scene/ModuleReferrer.h"
#include "host/scene/OrderedList.h"
#include "host/scene/UndoJournal.h"

class Character;
class Database;
class Marker;
class NLEClip;
class Node;

class Module : public HObject {
  H_DECLARE_CLASS(Module, HObject)

 public:
  enum EPathType { NameOnly = 0, ShortestPath = 1, FullPath = 3 };

  ~Module() override;

  // The scene that it was made for, in it or not: that which createModule was asked of, or the current one.
  Database* getDatabase() const { return m_database; }

  // --- names and paths ---
  virtual HString getName() const { return m_name; }
  ControlID getID() const { return m_id; }
  // Whether a name can stand: not empty, no backslash.
  static bool isValidName(HString const& name);
  // False for a name that cannot stand. Siblings' names are not looked at.
  bool setName(HString const& name);
  HString getPath(EPathType type) const;
  // The names from the root, each after a backslash.
  HString getFullPathString() const;
  // The shortest suffix of the full path that names this module alone. withinPriority: alone below the
  // priority module, when this module lies below it.
  HString getMinimumPathString(bool withinPriority) const;

  // --- namespaces: the prefixes of a name, joined by ":", outermost first ---
  virtual void getNamespace(HString& out) const;
  virtual void getNamespaces(TArray<HString>& out) const;
  virtual bool addNamespace(HString const& name);
  virtual bool removeNamespace(HString const& name);
  virtual bool replaceNamespace(HString const& former, HString const& name);

  // --- hierarchy ---
  Module* getParent() const { return m_parent; }
  int getNumChildren() const;
  Module* getChild(int i) const;
  // The nearest ancestor that is a node.
  Node* getNodeParent() const;
  int getNumNodeChildren() const;
  Node* getNodeChild(int i) const;
  // The i-th marker among the direct children, in child order.
  Marker* getMarkerChild(int i) const;
  int getNumMarkerChildren() const;
  // Index of the first marker child of that name, -1: none.
  int findMarkerChild(HString const& name) const;
  Character* getCharacterParent() const;  // the nearest ancestor that is a character
  bool isDescendedFrom(Module const* ancestor) const;
  // This module and all below it, parents first.
  void getModAndDecedents(TSimpleArray<Module*>& out);
  // Takes the child from its present parent. Refused: a module below itself, one that is not in the scene, a
  // character (it stays a root).
  virtual bool addChild(Module* child);
  // The child becomes a root. keepPlace: the scene's order stays as it is.
  virtual bool removeChild(Module* child, bool keepPlace);

  // --- attributes ---
  int getNumAttributes() const { return static_cast<int>(m_attributes.size()); }
  Attribute* getAttribute(int i) const { return itemAt(m_attributes, i); }
  Attribute* getAttribute(char const* name) const;  // exact case; null: none
  Attribute* getAttribute(ControlID id) const;
  // Adds a custom attribute. Null when the module has one of that name or PropertyTable knows an obstacle.
  Attribute* addCustomAttribute(std::unique_ptr<Attribute> attribute);

  // --- channels ---
  int getNumChannels() const { return static_cast<int>(m_channels.size()); }
  Controller* getChannel(int i) const { return itemAt(m_channels, i); }
  Controller* getChannel(char const* name) const;
  Controller* getChannel(ControlID id) const;
  Controller* getProperty(HString const& name) const { return getChannel(name.GetStr()); }
  Controller* getProperty(unsigned id) const;  // component bits do not matter
  // The module's channel of that name, added when it has none. Null when PropertyTable knows an obstacle.
  Controller* addChannel(HString const& name, DataSource::PropertyType type);
  // The channel's or attribute's number into `value`: empty on success, else the text to show. byDefault: the
  // channel's default value instead of that at the current time. A name may end in ".x", ".y", ".z".
  HString getPropertyVal(HString const& name, double& value, bool byDefault) const;

  // --- data ---
  virtual bool hasKeysInClip(NLEClip const* clip, bool allLayers) const;
  virtual void addToClip(NLEClip* clip);
  // From the first to the last key of all channels in the active clip.
  virtual HTimeRange getDataRange() const;
  virtual void beginDataEdit(HTimeRange const& range);
  virtual void endDataEdit();
  virtual void discardDataEdit();  // restores what was there when the edit began

  // --- state ---
  bool isVisible() const;
  void setVisible(bool visible, bool notify);
  bool isLocked() const;
  virtual bool isSelected() const { return m_selectionSlot != kNoSlot; }
  virtual void setSelected(bool selected);
  bool isInScene() const { return m_sceneSlot != kNoSlot; }

 protected:
  // The same for a channel of a class of its own.
  Controller* addChannel(HString const& name, std::unique_ptr<Controller> channel);
  Module();
  // Gives the module its built-in attributes and channels; called once, by the database, before it enters the
  // scene. A subclass calls its base first.
  virtual void setUp();
  Attribute* addAttribute(std::unique_ptr<Attribute> attribute, Attribute::Reaction reaction = nullptr);
  template <class T, class... Args>
  T* addBuiltIn(char const* name, Args&&... args) {
    auto attribute = std::make_unique<T>(std::forward<Args>(args)...);
    attribute->m_name = name;
    return static_cast<T*>(addAttribute(std::move(attribute)));
  }
  void setReaction(Attribute* attribute, Attribute::Reaction reaction) { attribute->m_reaction = reaction; }
  // Something that shows in the module's value at a time has changed.
  virtual void dataChanged(Controller const*) {}
  inline UndoJournal& journal() const;
  // Whether the undo journal is to hear of changes of this module: not while it is set up, nor in the step
  // that brings it into the scene. Every mutator asks, which checks that the thread holds the scene.
  inline bool isRecorded() const;

 private:
  friend class Attribute;
  friend class ConnectingLines;
  friend class Controller;
  friend class Database;
  friend class NameAttribute;
  friend class ModuleReferrer;
  friend class SceneIndex;
  friend class Selection;
  friend class ModuleHold;

  void storeName(HString const& name);                        // mutator
  void storeParent(Module* parent);                           // mutator: unlinks, links at the end
  void storeAttribute(std::unique_ptr<Attribute> attribute);  // mutator
  void storeChannel(std::unique_ptr<Controller> channel);     // mutator
  struct NameChange;
  struct ParentChange;
  template <class T>
  struct Addition;
  void moveTo(Module* parent, uint64 order);  // links by order
  void linkToParent();
  void unlinkFromParent();
  void sortChildren();
  int64 memoryUse() const;                   // with keys that nothing else shares
  void forgetByAll();                        // every referrer lets go
  std::string suffixText(int levels) const;  // the last `levels` names of the path

  struct Children;
  Children& children();

  Database* m_database;
  HString m_name;
  ControlID m_id;
  Module* m_parent = nullptr;
  std::unique_ptr<Children> m_children;  // null: none yet
  uint32 m_childSlot = kNoSlot;
  uint32 m_nodeChildSlot = kNoSlot;
  uint32 m_markerChildSlot = kNoSlot;
  uint32 m_sceneSlot = kNoSlot;
  uint32 m_selectionSlot = kNoSlot;
  uint64 m_order = 0;           // of creation
  uint64 m_childOrder = 0;      // among its siblings
  uint64 m_selectionOrder = 0;  // among what is selected
  uint64 m_enteredStep = 0;     // the undo step that brought it into the scene
  int m_undoHolds = 0;          // changes in the journal that tell of it
  std::vector<std::unique_ptr<Attribute>> m_attributes;
  std::vector<std::unique_ptr<Controller>> m_channels;
  // With the number of references that each holds; null: none yet.
  std::unique_ptr<std::unordered_map<ModuleReferrer*, int>> m_referrers;
  struct OpenEdit;
  std::unique_ptr<OpenEdit> m_dataEdit;  // only while an edit is open
};
