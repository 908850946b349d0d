// The parts of taking a take into the scene. They run after all checks: none of them fails half way, except
// that importDevices may run out of channel names; it comes first, and the clip and its devices are then
// taken back.
#pragma once

#include <string>
#include <unordered_map>
#include <vector>

#include "host/scene/Database.h"
#include "io/Take.h"
#include "io/scene/UpAxisConversion.h"

namespace talix {

// What the parts share: the clip that the motion goes to, and the modules that stand where the take wants
// some.
class TakeImport {
 public:
  TakeImport(Database& scene, Clip& clip, UpAxisConversion const& turn, std::string fileName,
             std::vector<TakeNote>& notes);

  Clip& clip() const { return m_clip; }
  UpAxisConversion const& turn() const { return m_turn; }
  void info(std::string const& text) { note(TakeNote::Level::Info, text); }
  void warn(std::string const& text) { note(TakeNote::Level::Warning, text); }

  // The module of that name below `parent` (null: root) that was there before the import and that `fits`,
  // each handed out once; else a new one of `type`, of exactly that name. isNew (may be null): whether it was
  // made.
  template <class T>
  T* place(bool (*fits)(Module const&), std::string const& name, Module* parent, bool* isNew = nullptr) {
    return static_cast<T*>(placeModule(&T::staticClass(), fits, name, parent, isNew));
  }
  // A new marker at the root under a free name.
  Marker* placeUnlabeled();
  // The character at the root with that name; each name stands for one.
  Character* character(std::string const& name, bool* isNew = nullptr);
  // The character for what the file names no subject of.
  Character* fileCharacter(std::string const& takeName);

  std::vector<Module*> const& created() const { return m_created; }
  // Says which names clash now.
  void noteRepeatedNames();

 private:
  using Waiting = std::unordered_map<std::string, std::vector<Module*>>;  // in order, null once handed out

  Module* placeModule(HRuntimeClass* type, bool (*fits)(Module const&), std::string const& name,
                      Module* parent, bool* isNew);
  Waiting& waitingBelow(Module* parent);
  void note(TakeNote::Level level, std::string const& text) {
    m_notes.push_back({level, m_fileName + ": " + text});
  }

  Database& m_scene;
  Clip& m_clip;
  UpAxisConversion m_turn;
  std::string m_fileName;
  std::vector<TakeNote>& m_notes;
  std::unordered_map<Module*, Waiting> m_waiting;
  std::unordered_map<std::string, Character*> m_characters;
  std::vector<Module*> m_created;
  std::vector<std::string> m_repeated;  // paths
};

// A name as modules can have it: "\" becomes "_".
std::string moduleName(std::string const& name);

// "1 point", "3 points"
std::string counted(int64 count, std::string const& noun);

// Throws FileError when there is no channel name left.
void importDevices(TakeImport&, Take&, std::string const& path);
void importPoints(TakeImport&, Take&);
void importJoints(TakeImport&, Take&);

}  // namespace talix
