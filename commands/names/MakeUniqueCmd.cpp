#include <charconv>
#include <string>
#include <string_view>
#include <unordered_map>
#include <unordered_set>
#include <utility>
#include <vector>

#include "host/command/ScriptCommand.h"
#include "host/scene/Database.h"
#include "host/services/OperationStack.h"

namespace {

struct NumberedName {
  std::string_view base;
  int64 number;
};

constexpr size_t kMostDigits = 18;  // longer numbers belong to the name

// kept: the mark is looked for one place before the last character that is no digit, so "a_x5" is "a" and 5,
// while "a_5" is its own base.
NumberedName split(std::string_view name) {
  size_t const last = name.find_last_not_of("0123456789");
  bool const numbered = last != std::string_view::npos && last > 0 && last + 1 < name.size();
  int64 number = 0;
  if (!numbered || name[last - 1] != '_' || name.size() - last - 1 > kMostDigits) return {name, 0};
  std::from_chars(name.data() + last + 1, name.data() + name.size(), number);
  return {name.substr(0, last - 1), number};
}

// Numbers full paths: equal numbers, equal paths. The names from the root to a deep module would be written
// out anew for every module of a chain; so each path is the number of the path above it and a name.
//
//  1. Below a module that has a number either all modules have one, or none.
//  2. None means that it was renamed, to a path that no other module had; so whoever shares a path with a
//     module that has a number has one, too.
class PathNumbers {
 public:
  static constexpr size_t kRoot = 0;

  PathNumbers() {
    for (int i = 0; i < g_db->getNumModules(); ++i)
      if (Module const* module = g_db->getModule(i); !module->getParent()) numberFrom(*module, kRoot);
  }

  size_t of(Module const& module) {
    Module const* known = &module;
    while (!m_byModule.contains(known)) known = known->getParent();
    if (known != &module) numberBelow(*known);
    return m_byModule.at(&module);
  }
  size_t ofParent(Module const& module) { return module.getParent() ? of(*module.getParent()) : kRoot; }

  // The first number above `number` for which ABOVE\BASE_NUMBER names no module.
  int64 freeNumber(size_t above, std::string const& base, int64 number) {
    Next& next = m_next[{above, base}];
    auto const isTaken = [&](int64 candidate) {
      auto const path = m_byName.find({above, base + "_" + std::to_string(candidate)});
      return path != m_byName.end() && m_holders[path->second] > 0;
    };
    int64 free = number + 1;
    while (true) {
      free = afterTaken(next, free);
      if (!isTaken(free)) return free;
      next[free] = free + 1;
    }
  }

  // A module has another name: the paths at and below it are others.
  void renumber(Module const& renamed) {
    size_t const above = ofParent(renamed);
    std::vector<Module const*> open{&renamed};
    while (!open.empty()) {
      Module const* module = open.back();
      open.pop_back();
      auto const known = m_byModule.find(module);
      if (known == m_byModule.end()) continue;  // then none below it is known
      release(known->second);
      m_byModule.erase(known);
      for (int i = 0; i < module->getNumChildren(); ++i) open.push_back(module->getChild(i));
    }
    number(renamed, above);
  }

 private:
  using Path = std::pair<size_t, std::string>;  // the path above, the name
  struct PathHash {
    size_t operator()(Path const& path) const {
      return std::hash<std::string>()(path.second) * 31 + std::hash<size_t>()(path.first);
    }
  };
  // For a taken number one further on; following these leads to the next number that is not known as taken,
  // so that many modules that clash do not all try the same ones again.
  using Next = std::unordered_map<int64, int64>;

  size_t number(Module const& module, size_t above) {
    auto const path = m_byName.try_emplace({above, module.getName().GetString()}, m_holders.size()).first;
    if (path->second == m_holders.size()) {
      m_holders.push_back(0);
      m_paths.push_back(&path->first);
    }
    ++m_holders[path->second];
    return m_byModule[&module] = path->second;
  }
  void numberFrom(Module const& top, size_t above) {
    number(top, above);
    numberBelow(top);
  }
  void numberBelow(Module const& top) {
    std::vector<Module const*> open{&top};
    while (!open.empty()) {
      Module const* module = open.back();
      open.pop_back();
      size_t const path = m_byModule.at(module);
      for (int i = 0; i < module->getNumChildren(); ++i) {
        number(*module->getChild(i), path);
        open.push_back(module->getChild(i));
      }
    }
  }
  // One module less has the path: without any its number is free again.
  void release(size_t path) {
    if (--m_holders[path] > 0) return;
    auto const& [above, name] = *m_paths[path];
    size_t const last = name.find_last_not_of("0123456789");
    if (last != std::string::npos && name[last] == '_') m_next.erase({above, name.substr(0, last)});
  }

  static int64 afterTaken(Next& next, int64 number) {
    int64 end = number;
    for (auto found = next.find(end); found != next.end(); found = next.find(end)) end = found->second;
    // The way is short for those who come after.
    for (auto found = next.find(number); found != next.end(); found = next.find(number))
      number = std::exchange(found->second, end);
    return end;
  }

  std::unordered_map<Module const*, size_t> m_byModule;
  std::unordered_map<Path, size_t, PathHash> m_byName;
  std::vector<int> m_holders{0};                    // by path: how many modules have it
  std::vector<Path const*> m_paths{nullptr};        // by path
  std::unordered_map<Path, Next, PathHash> m_next;  // by the path above and the text before the number
};

class MakeUniqueCmd final : public ScriptCommand<MakeUniqueCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "makeUnique",
      .displayName = "Make Module Paths Unique",
      .category = "Data Editing",
      .purpose = "Renames modules so that no two have the same full path.",
      .example = "makeUnique",
      .argsText =
          "Looks at every module of the scene, selected or not, in order of creation. The first with a path "
          "keeps its name; each further one gets a number, such as _1."};

  bool execute(Given const&, Args const&, Variable&) override {
    std::unordered_set<size_t> seen;
    PathNumbers paths;
    int const count = g_db->getNumModules();
    for (int i = 0; i < count; ++i) {
      if (g_theOperationStack.isCancelled()) return false;
      Module* module = g_db->getModule(i);
      if (seen.insert(paths.of(*module)).second) continue;
      rename(*module, paths);
    }
    return true;
  }

 private:
  // kept: the new path does not count as seen.
  static void rename(Module& module, PathNumbers& paths) {
    HString const name = module.getName();
    auto const [base, number] = split(name.GetString());
    HString candidate;
    int64 const free = paths.freeNumber(paths.ofParent(module), std::string(base), number);
    candidate.Format("%s_%lld", std::string(base).c_str(), static_cast<long long>(free));
    auto* attribute = static_cast<StringAttribute*>(module.getAttribute("Name"));
    attribute->setValue(candidate, true, true, 0, true, true);
    paths.renumber(module);
  }
};

}  // namespace

Command* newMakeUniqueCmd() { return new (std::nothrow) MakeUniqueCmd; }
