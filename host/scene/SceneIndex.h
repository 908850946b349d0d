// Finds modules by path. Indexed by name, and by parent and name, so that a look-up does not walk the scene.
#pragma once

#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "host/scene/Module.h"

class SceneIndex {
 public:
  void add(Module* module);
  void remove(Module* module);  // before its name or parent changes

  // The module that a full path (from a backslash on) names: the first created of those that have it.
  Module* findFull(std::string_view path, HRuntimeClass const* filter, Module const* below) const;
  // The one module with this suffix of a full path; null when none or several fit. `below` (may be null)
  // limits the search to it and its descendants.
  Module* findSuffix(std::string_view path, HRuntimeClass const* filter, Module const* below) const;

  // The first created child of `parent` (null: root) with that name.
  Module* findChild(Module const* parent, std::string_view name) const;
  // A name for a new child of `parent` that its siblings do not have: `wanted`, else wanted_1, wanted_2, the
  // lowest free number.
  HString freeName(Module const* parent, HString const& wanted);

  // How many names, from the module's own upward, tell it from all others (only from those below `below` when
  // that is not null); 0 when not even the full path does.
  int levelsToTell(Module const* module, Module const* below) const;

 private:
  struct ChildKey {
    Module const* parent;
    std::string_view name;
    bool operator==(ChildKey const&) const = default;
  };
  struct ChildHash {
    size_t operator()(ChildKey const& key) const {
      return std::hash<std::string_view>()(key.name) * 31 + std::hash<Module const*>()(key.parent);
    }
  };
  // Modules of one name (of one parent and name), in order of creation. The key's text lies in `name`.
  struct Bucket {
    std::unique_ptr<std::string> name;
    std::vector<Module*> modules;
  };

  template <class Visit>
  void forEachWithSuffix(std::vector<std::string_view> const& names, Visit visit) const;
  Bucket const* bucket(std::string_view name) const;
  void freeNumber(Module const* parent, std::string_view name);

  std::unordered_map<std::string_view, Bucket> m_byName;
  std::unordered_map<ChildKey, Bucket, ChildHash> m_byParent;
  // Below these numbers no name "base_N" is free among the children of a parent.
  std::unordered_map<Module const*, std::unordered_map<std::string, int>> m_nextNumber;
};
