// Runs script lines against the scene.
//
// A line runs through its command's own argument check; what the command logs meanwhile is collected. Nothing
// that a command does or throws ends the program, but for a lack of memory that leaves nothing to go on with:
// a line that runs out of it is taken back whole where steps are kept (setUndo), else the scene counts as
// torn. A session works on one scene, on whichever thread asks it to.
#pragma once

#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "host/base/Log.h"
#include "host/scene/Database.h"
#include "session/CommandRegistry.h"
#include "session/PluginLoader.h"
#include "session/ScriptLine.h"

namespace talix {

struct LogLine {
  LogLevel level;
  std::string text;
};

struct LineResult {
  enum class Outcome {
    Blank,  // nothing was run
    Done,
    Failed,      // refused, or the command failed
    FileFailed,  // a file could not be read or written
    OutOfMemory  // the command ran out of memory
  } outcome = Outcome::Blank;
  std::string command;  // as typed
  Variable value;       // empty when there is none
  std::vector<LogLine> log;

  bool torn = false;  // the scene may hold half of what the line was to do

  bool failed() const { return outcome > Outcome::Done; }
};

class Session {
 public:
  // `plugin`: the library whose commands come before the host's own; empty for none. `scene` must live
  // longer; the caller owns it. Throws PluginError.
  explicit Session(std::string const& plugin, Database& scene = Database::current());
  ~Session();
  Session(Session const&) = delete;
  Session& operator=(Session const&) = delete;

  Database& scene() const { return m_scene; }
  CommandRegistry const& commands() const { return m_registry; }
  PluginLibrary const* plugin() const { return m_plugin.get(); }

  // The answer to every question that a command asks; no when not set.
  void setAssumeYes(bool yes);

  // Keeps what lines change, each line a step, for "undo" and "redo"; off at start.
  void setUndo(bool on);

  // Runs one line. The result lasts until the next one. Throws SceneHeldError when another thread works on
  // the scene; so do the two above.
  LineResult const& run(std::string_view line);

 private:
  struct Release {
    void operator()(Command* command) const { command->deleteThis(); }
  };

  LineResult::Outcome execute();
  LineResult::Outcome guarded(std::string_view line);
  void runStep(std::string_view line);
  void takeBack();
  void warnOfExclusions() const;

  Database& m_scene;
  std::unique_ptr<PluginLibrary> m_plugin;
  std::vector<std::unique_ptr<Command, Release>> m_hostCommands;
  CommandRegistry m_registry;
  ScriptLine m_line;
  LineResult m_result;
  char const* m_lackOfMemory = nullptr;  // how it was reported
};

}  // namespace talix
