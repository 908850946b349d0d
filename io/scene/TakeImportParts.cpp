#include "io/scene/TakeImportParts.h"

#include <algorithm>

#include "io/scene/FileMetadata.h"

namespace talix {

namespace {

bool isCharacter(Module const& module) { return module.isKindOf(&Character::staticClass()); }

}  // namespace

std::string moduleName(std::string const& name) {
  std::string mended = name;
  std::replace(mended.begin(), mended.end(), '\\', '_');
  return mended;
}

std::string counted(int64 count, std::string const& noun) {
  return std::to_string(count) + " " + noun + (count == 1 ? "" : "s");
}

TakeImport::TakeImport(Database& scene, Clip& clip, UpAxisConversion const& turn, std::string fileName,
                       std::vector<TakeNote>& notes)
    : m_scene(scene), m_clip(clip), m_turn(turn), m_fileName(std::move(fileName)), m_notes(notes) {
  fileMetadata::reserveNames(m_scene.getPropertyTable());
}

// What stands below a parent before the import puts anything there.
TakeImport::Waiting& TakeImport::waitingBelow(Module* parent) {
  auto const [entry, isFirst] = m_waiting.try_emplace(parent);
  Waiting& waiting = entry->second;
  if (!isFirst) return waiting;
  if (parent) {
    for (int i = 0; i < parent->getNumChildren(); ++i) {
      Module* child = parent->getChild(i);
      waiting[child->getName().GetString()].push_back(child);
    }
  } else {
    for (int i = 0; i < m_scene.getNumModules(); ++i) {
      Module* module = m_scene.getModule(i);
      if (!module->getParent()) waiting[module->getName().GetString()].push_back(module);
    }
  }
  return waiting;
}

Module* TakeImport::placeModule(HRuntimeClass* type, bool (*fits)(Module const&), std::string const& name,
                                Module* parent, bool* isNew) {
  if (isNew) *isNew = false;
  Waiting& waiting = waitingBelow(parent);
  if (auto const found = waiting.find(name); found != waiting.end()) {
    for (Module*& module : found->second)
      if (module && fits(*module)) return std::exchange(module, nullptr);
  }
  Module* made = m_scene.createModule(type, name.c_str(), parent);
  m_created.push_back(made);
  if (isNew) *isNew = true;
  if (made->getName() != name.c_str()) {
    made->setName(name);
    m_repeated.push_back(made->getFullPathString().GetString());
  }
  return made;
}

Marker* TakeImport::placeUnlabeled() {
  Module* made = m_scene.createModule(&Marker::staticClass(), "unlabeled", nullptr);
  m_created.push_back(made);
  return static_cast<Marker*>(made);
}

Character* TakeImport::character(std::string const& name, bool* isNew) {
  if (isNew) *isNew = false;
  Character*& known = m_characters[name];
  if (!known) known = place<Character>(isCharacter, name, nullptr, isNew);
  return known;
}

Character* TakeImport::fileCharacter(std::string const& takeName) {
  bool isNew = false;
  std::string const name = moduleName(takeName);
  Character* found = character(name, &isNew);
  if (isNew) fileMetadata::setText(*found, fileMetadata::kFileName, name);
  return found;
}

void TakeImport::noteRepeatedNames() {
  if (m_repeated.empty()) return;
  std::string const first = "\"" + m_repeated.front() + "\"";
  if (m_repeated.size() == 1)
    info("the name " + first + " stands more than once");
  else
    info(counted(static_cast<int64>(m_repeated.size()), "name") + " stand more than once, such as " + first);
}

}  // namespace talix
