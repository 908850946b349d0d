#include "session/Session.h"

#include <new>

#include "host/scene/SceneScope.h"
#include "host/services/HEvent.h"
#include "host/services/HInterface.h"
#include "host/services/OperationStack.h"
#include "io/FileError.h"
#include "session/CommandHelp.h"
#include "session/hostcommands/HostCommands.h"

namespace talix {

namespace {

// Collects what is logged while it lives.
class LogCollector : public LogSink {
 public:
  explicit LogCollector(std::vector<LogLine>& lines) : m_lines(lines), m_former(setLogSink(this)) {}
  ~LogCollector() override { setLogSink(m_former); }
  LogCollector(LogCollector const&) = delete;
  LogCollector& operator=(LogCollector const&) = delete;
  void write(LogLevel level, std::string_view text) override {
    m_lines.push_back({level, std::string(text)});
  }

 private:
  std::vector<LogLine>& m_lines;
  LogSink* m_former;
};

}  // namespace

Session::Session(std::string const& plugin, Database& scene) : m_scene(scene) {
  SceneScope const scope(m_scene);
  if (!plugin.empty()) {
    m_plugin = std::make_unique<PluginLibrary>(plugin);
    for (PluginLibrary::Item const& item : m_plugin->commands()) m_registry.add(item.command, item.source);
  }
  for (Command* command : makeHostCommands(m_registry)) m_hostCommands.emplace_back(command);
  for (auto const& command : m_hostCommands) m_registry.add(command.get(), "host");
}

Session::~Session() {
  setAssumeYes(false);
  setUndo(false);
}

void Session::setAssumeYes(bool yes) {
  SceneScope const scope(m_scene);
  g_interface->setAsker([yes](HString const&) { return yes; });
}

void Session::setUndo(bool on) {
  SceneScope const scope(m_scene);
  m_scene.getUndoJournal().setEnabled(on);
}

LineResult const& Session::run(std::string_view line) {
  SceneScope const scope(m_scene);
  bool const keepsSteps = m_scene.getUndoJournal().isEnabled();
  ThrowsBadAlloc const throws(keepsSteps);
  m_result.log.clear();
  m_result.value = Variable();
  m_result.torn = false;
  m_lackOfMemory = "Out of memory";
  try {
    runStep(line);
  } catch (std::bad_alloc const&) {
    m_result.outcome = LineResult::Outcome::OutOfMemory;
  }
  if (m_result.outcome == LineResult::Outcome::OutOfMemory) takeBack();
  if (m_result.failed()) m_result.value = Variable();
  return m_result;
}

// The step is closed last: until then everything can be taken back.
void Session::runStep(std::string_view line) {
  LogCollector const collector(m_result.log);
  UndoJournal& journal = m_scene.getUndoJournal();
  journal.beginStep();
  m_result.outcome = guarded(line);
  m_result.command = m_line.name();
  if (m_result.outcome == LineResult::Outcome::OutOfMemory) return;
  if (journal.isEnabled()) {
    // The line may have set it.
    constexpr int64 kMebibyte = 1 << 20;
    journal.setMemoryLimit(g_interface->getProfile(profile::kUndoMemory) * kMebibyte);
  }
  m_scene.releaseRemoved();
  g_theOperationStack.reset();
  g_eventManager->deliverQueued();
  journal.endStep(m_line.name());
}

void Session::takeBack() {
  m_result.torn = !m_scene.getUndoJournal().discardStep();
  m_scene.releaseRemoved();
  g_theOperationStack.reset();
  m_result.log.push_back({LogLevel::Error, m_lackOfMemory});
}

LineResult::Outcome Session::guarded(std::string_view line) {
  using Outcome = LineResult::Outcome;
  try {
    switch (m_line.read(line, m_registry)) {
      case ScriptLine::Outcome::Blank:
        return Outcome::Blank;
      case ScriptLine::Outcome::Refused:
        writeLog(LogLevel::Error, m_line.problem());
        return Outcome::Failed;
      case ScriptLine::Outcome::Command:
        return execute();
    }
  } catch (FileError const& error) {
    writeLog(LogLevel::Error, error.what());
    return Outcome::FileFailed;
  } catch (char const* text) {
    // How the host's own arrays report that memory ran out.
    m_lackOfMemory = text;
    return Outcome::OutOfMemory;
  } catch (std::bad_alloc const&) {
    return Outcome::OutOfMemory;
  } catch (std::exception const& error) {
    writeLog(LogLevel::Error, error.what());
  }
  return Outcome::Failed;
}

LineResult::Outcome Session::execute() {
  Command& command = *m_line.command();
  if (!command.checkArgSyntax(m_line.args(), m_line.options())) {
    std::string const syntax = argSyntax(command);
    writeLog(LogLevel::Error, "Usage: " + m_line.name() + (syntax.empty() ? "" : " " + syntax));
    return LineResult::Outcome::Failed;
  }
  warnOfExclusions();
  bool const done = command.execute(m_line.options(), m_line.args(), m_result.value);
  return done ? LineResult::Outcome::Done : LineResult::Outcome::Failed;
}

// Two options exclude each other only when both say so.
void Session::warnOfExclusions() const {
  std::vector<CommandOption const*> given;  // each once, in the order given
  uint64 seen = 0;
  for (CommandOption const& option : m_line.options()) {
    uint64 const bit = uint64{1} << option.getIndex();
    if (option.getMask() != 0 && (seen & bit) == 0) given.push_back(&option);
    seen |= bit;
  }
  for (auto first = given.begin(); first != given.end(); ++first) {
    for (auto second = first + 1; second != given.end(); ++second) {
      if (!excludeEachOther(**first, **second)) continue;
      writeLog(LogLevel::Warning, "Options -" + (*first)->getName().GetString() + " and -" +
                                      (*second)->getName().GetString() + " exclude each other");
    }
  }
}

}  // namespace talix
