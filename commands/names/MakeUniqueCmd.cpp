#include <charconv>
#include <map>
#include <string>
#include <string_view>
#include <unordered_map>
#include <unordered_set>
#include <utility>
#include <vector>

#include "host/command/ScriptCommand.h"
#include "host/scene/Database.h"
#include "host/scene/ModulePath.h"
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
class PathNumbers {
 public:
  size_t of(Module const& module) {
    std::vector<Module const*> unknown;
    Module const* known = &module;
    for (; known && !m_byModule.contains(known); known = known->getParent()) unknown.push_back(known);
    size_t path = known ? m_byModule.at(known) : 0;
    for (auto next = unknown.rbegin(); next != unknown.rend(); ++next) {
      auto const [entry, isNew] =
          m_byName.try_emplace({path, (*next)->getName().GetString()}, m_byName.size() + 1);
      m_byModule[*next] = path = entry->second;
    }
    return path;
  }
  // A module has another name: the paths at and below it are others.
  void forget(Module const& renamed) {
    std::vector<Module const*> open{&renamed};
    while (!open.empty()) {
      Module const* module = open.back();
      open.pop_back();
      if (m_byModule.erase(module) == 0) continue;  // then none below it is known
      for (int i = 0; i < module->getNumChildren(); ++i) open.push_back(module->getChild(i));
    }
  }

 private:
  std::unordered_map<Module const*, size_t> m_byModule;
  std::map<std::pair<size_t, std::string>, size_t> m_byName;
};

// Remembers which of the paths TEXT_1, TEXT_2, ... were found taken, so that many modules that clash do not
// all try them again.
class TakenPaths {
 public:
  // The first number above `number` whose path names no module.
  int64 freeNumber(std::string const& text, int64 number) {
    Next& next = m_next[text];
    auto const isTaken = [&](int64 candidate) {
      HString const path = text + "_" + std::to_string(candidate);
      return g_db->getModuleWithPath(path, nullptr, false) != nullptr;
    };
    int64 free = number + 1;
    while (true) {
      free = behindTaken(next, free);
      if (!isTaken(free)) return free;
      next[free] = free + 1;
    }
  }

  // A module has left this path with all below it: what was taken there may be free.
  void forget(std::string const& path) {
    m_next.erase(m_next.lower_bound(path + "\\"), m_next.lower_bound(path + static_cast<char>('\\' + 1)));
    if (g_db->getModuleWithPath(path, nullptr, false)) return;
    size_t const mark = path.find_last_not_of("0123456789");
    if (path[mark] == '_') m_next.erase(path.substr(0, mark));
  }

 private:
  // For a taken number one further on; following these leads to the next number that is not known as taken.
  using Next = std::unordered_map<int64, int64>;

  static int64 behindTaken(Next& next, int64 number) {
    int64 end = number;
    for (auto found = next.find(end); found != next.end(); found = next.find(end)) end = found->second;
    // The way is short for those who come after.
    for (auto found = next.find(number); found != next.end(); found = next.find(number))
      number = std::exchange(found->second, end);
    return end;
  }

  std::map<std::string, Next> m_next;  // by text
};

class MakeUniqueCmd final : public ScriptCommand<MakeUniqueCmd> {
 public:
  static constexpr CommandInfo info = {.name = "makeUnique",
                                       .displayName = "Make Module Paths Unique",
                                       .category = "Data Editing",
                                       .purpose = "Renames modules so that no two have the same full path."};

  bool execute(Given const&, Args const&, Variable&) override {
    std::unordered_set<size_t> seen;
    PathNumbers paths;
    TakenPaths taken;
    int const count = g_db->getNumModules();
    for (int i = 0; i < count; ++i) {
      if (g_theOperationStack.isCancelled()) return false;
      Module* module = g_db->getModule(i);
      if (seen.insert(paths.of(*module)).second) continue;
      rename(*module, taken);
      paths.forget(*module);
    }
    return true;
  }

 private:
  // kept: the new path does not count as seen.
  static void rename(Module& module, TakenPaths& taken) {
    HString const former = module.getFullPathString(), name = module.getName();
    auto const [base, number] = split(name.GetString());
    ModulePath parent(&module);
    parent.pop();
    std::string const text = parent.getFullPathString().GetString() + "\\" + std::string(base);
    HString candidate;
    candidate.Format("%s_%lld", std::string(base).c_str(),
                     static_cast<long long>(taken.freeNumber(text, number)));
    auto* attribute = static_cast<StringAttribute*>(module.getAttribute("Name"));
    attribute->setValue(candidate, true, true, 0, true, true);
    taken.forget(former.GetString());
  }
};

}  // namespace

Command* newMakeUniqueCmd() { return new (std::nothrow) MakeUniqueCmd; }
