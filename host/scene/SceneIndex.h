// Finds modules by path. Indexed by name, and by parent and name, so that a look-up does not walk the scene.
#pragma once

#include <memory>
#include <set>
#include <span>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "host/scene/Module.h"

class SceneIndex {
 public:
  // On an exception the index is as before.
  void add(Module* module);
  // Before its name or parent changes; nothing when it is not there.
  void remove(Module* module) noexcept;
  // A module is leaving the scene: what is known of its children's names goes.
  void forgetParent(Module const* parent) { m_numbers.erase(parent); }

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
  // Calls visit(module) for the children of that name, first created first, until it returns false.
  template <class Visit>
  void forEachChild(Module const* parent, std::string_view name, Visit visit) const;

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
  // Modules in order of creation. Most often there is one; clashing ones come and go at any place, which a
  // set bears however many they are.
  class ByAge {
   public:
    bool empty() const { return !m_only && !m_several; }
    size_t size() const { return m_several ? m_several->size() : m_only ? 1 : 0; }
    Module* first() const { return m_several ? *m_several->begin() : m_only; }
    void insert(Module* module);
    void erase(Module* module);
    // Calls visit(module) in order until it returns false; returns whether it never did.
    template <class Visit>
    bool forEach(Visit visit) const;

   private:
    struct Earlier {
      bool operator()(Module const* a, Module const* b) const { return a->m_order < b->m_order; }
    };
    Module* m_only = nullptr;
    std::unique_ptr<std::set<Module*, Earlier>> m_several;  // in place of m_only
  };
  // The modules of one name (of one parent and name). The key's text lies in `name`.
  struct Bucket {
    std::unique_ptr<std::string> name;
    ByAge modules;
  };
  // Of the names "base_1", "base_2", ... below a parent those before `next` are taken, but for the freed
  // ones.
  struct Numbers {
    int next = 1;
    std::set<int> freed;
  };

  template <class Visit>
  bool forEachBelow(Module* top, std::span<std::string_view const> names, Visit visit) const;
  template <class Visit>
  void forEachWithSuffix(std::vector<std::string_view> const& names, Visit visit) const;
  ByAge const* modulesNamed(std::string_view name) const;
  ByAge const* childrenNamed(Module const* parent, std::string_view name) const;
  void freeNumber(Module const* parent, std::string_view name) noexcept;

  std::unordered_map<std::string_view, Bucket> m_byName;
  std::unordered_map<ChildKey, Bucket, ChildHash> m_byParent;
  std::unordered_map<Module const*, std::unordered_map<std::string, Numbers>> m_numbers;
};

template <class Visit>
bool SceneIndex::ByAge::forEach(Visit visit) const {
  if (!m_several) return !m_only || visit(m_only);
  for (Module* module : *m_several)
    if (!visit(module)) return false;
  return true;
}

template <class Visit>
void SceneIndex::forEachChild(Module const* parent, std::string_view name, Visit visit) const {
  if (ByAge const* children = childrenNamed(parent, name)) children->forEach(visit);
}
