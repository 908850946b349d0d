// Runs script lines against the scene.
//
// A line runs through its command's own argument check; what the command logs meanwhile is collected. Nothing
// that a command does or throws ends the program. The scene is the engine's (g_db): there is one, however
// many sessions.
#pragma once

#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "host/base/Log.h"
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
    Failed,     // refused, or the command failed
    FileFailed  // a file could not be read or written
  } outcome = Outcome::Blank;
  std::string command;  // as typed
  Variable value;       // empty when there is none
  std::vector<LogLine> log;

  bool failed() const { return outcome == Outcome::Failed || outcome == Outcome::FileFailed; }
};

class Session {
 public:
  // `plugin`: the library whose commands come before the host's own; empty for none. Throws PluginError.
  explicit Session(std::string const& plugin);
  ~Session();
  Session(Session const&) = delete;
  Session& operator=(Session const&) = delete;

  CommandRegistry const& commands() const { return m_registry; }
  PluginLibrary const* plugin() const { return m_plugin.get(); }

  // The answer to every question that a command asks; no when not set.
  void setAssumeYes(bool yes);

  // Keeps what lines change, each line a step, for "undo" and "redo"; off at start.
  void setUndo(bool on);

  // Runs one line. The answer lasts until the next one.
  LineResult const& run(std::string_view line);

 private:
  struct Release {
    void operator()(Command* command) const { command->deleteThis(); }
  };

  LineResult::Outcome execute();
  LineResult::Outcome guarded(std::string_view line);
  void warnOfExclusions() const;

  std::unique_ptr<PluginLibrary> m_plugin;
  std::vector<std::unique_ptr<Command, Release>> m_hostCommands;
  CommandRegistry m_registry;
  ScriptLine m_line;
  LineResult m_result;
};

}  // namespace talix
