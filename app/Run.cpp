#include "app/Run.h"

#include <algorithm>
#include <boost/json.hpp>
#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <iostream>
#include <set>
#include <unistd.h>

#include "app/Progress.h"
#include "host/scene/Database.h"
#include "host/services/HInterface.h"
#include "io/FileError.h"
#include "io/TakeFormats.h"
#include "session/CommandHelp.h"
#include "session/JsonForms.h"
#include "session/JsonText.h"
#include "session/ManPage.h"
#include "session/RegistryPage.h"
#include "session/ScriptRunner.h"
#include "session/ScriptText.h"

namespace talix {

namespace {

constexpr char const* kStandardInput = "-";

std::string programFolder() {
  std::error_code error;
  auto const program = std::filesystem::read_symlink("/proc/self/exe", error);
  return error ? "." : program.parent_path().string();
}

// The user's settings: the file that TALIX_PROFILE names (none when it is empty), else talix/profile.ini in
// the folder for configuration. Writing settings makes it when it is missing.
void loadUserProfile() {
  char const* given = std::getenv("TALIX_PROFILE");
  std::filesystem::path file = given ? given : "";
  if (!given) {
    char const* folder = std::getenv("XDG_CONFIG_HOME");
    if (char const* home = std::getenv("HOME"); folder && *folder)
      file = std::filesystem::path(folder) / "talix/profile.ini";
    else if (home && *home)
      file = std::filesystem::path(home) / ".config/talix/profile.ini";
  }
  if (!file.empty()) g_interface->loadProfile(file.string());
}

int failed(Status status, std::string const& text) {
  std::fprintf(stderr, "error: %s\n", text.c_str());
  return static_cast<int>(status);
}

// A session, or null with `status` set when the plug-in cannot be used.
std::unique_ptr<Session> makeSession(PluginChoice const& plugin, int& status) {
  Database::setDevOnlyMode(plugin.developer);
  try {
    return std::make_unique<Session>(plugin.file.empty() ? findPlugin(programFolder()) : plugin.file);
  } catch (std::exception const& error) {
    status = failed(Status::FileFailed, error.what());
    return nullptr;
  }
}

// Returns `status` once all output is out. Somebody who stops reading is told nothing: he knows.
int finished(int status, bool written) {
  if (written) return status;
  if (errno != EPIPE) std::fprintf(stderr, "error: standard output: %s\n", std::strerror(errno));
  return static_cast<int>(Status::FileFailed);
}

// After a take that could not be opened or saved.
int failureOf(ScriptRunner const& runner) {
  return static_cast<int>(runner.status() == Status::OutOfMemory ? Status::OutOfMemory : Status::FileFailed);
}

bool runStandardInput(ScriptRunner& runner) {
  std::string line;
  for (int number = 1; std::getline(std::cin, line); ++number)
    if (!runner.runLine(line, kStandardInput, number)) return false;
  return true;
}

bool isStandardInput(RunRequest::Part const& part) { return !part.isLine && part.text == kStandardInput; }

// What each part runs; nothing for standard input, which is read as it comes.
std::vector<std::string> readParts(std::vector<RunRequest::Part> const& parts) {
  std::vector<std::string> texts;
  for (RunRequest::Part const& part : parts)
    texts.push_back(part.isLine ? part.text : isStandardInput(part) ? "" : readScript(part.text));
  return texts;
}

// The parts in order, until one fails. Lines of the command line are counted through.
void runParts(ScriptRunner& runner, std::vector<RunRequest::Part> const& parts,
              std::vector<std::string> const& texts) {
  int lines = 0;
  bool going = true;
  for (size_t i = 0; going && i < parts.size(); ++i) {
    if (isStandardInput(parts[i])) {
      going = runStandardInput(runner);
    } else if (parts[i].isLine) {
      going = runner.runText(texts[i], "-c", lines + 1);
      lines += 1 + static_cast<int>(std::count(texts[i].begin(), texts[i].end(), '\n'));
    } else {
      going = runner.runText(texts[i], parts[i].text, 1);
    }
  }
}

// The exit status after a text that is all that is asked for.
int printed(std::string const& text) {
  bool const written = std::fputs(text.c_str(), stdout) >= 0 && std::fflush(stdout) == 0;
  return finished(0, written);
}

}  // namespace

int runScripts(RunRequest const& request) {
  loadUserProfile();
  int status = 0;
  std::unique_ptr<Session> const session = makeSession(request.plugin, status);
  if (!session) return status;
  if (request.assumeYes)
    session->setAssumeYes(true);
  else if (canAsk())
    g_interface->setAsker([](HString const& question) { return askAtTerminal(question.GetString()); });
  Progress const progress;
  RunStyle style{
      .json = request.json, .keepGoing = request.keepGoing, .nameLines = isatty(STDERR_FILENO) != 0};
  for (RunRequest::Part const& part : request.parts) style.flushLines |= isStandardInput(part);
  ScriptRunner runner(*session, style, stdout, stderr);

  try {
    // A script that cannot be read and a place that cannot be written are told before anything is run.
    for (std::string const& file : request.saves) checkTakeTarget(file);
    std::vector<std::string> const texts = readParts(request.parts);
    // A journal is kept only for scripts that use it, and for what is yet to be read.
    session->setUndo(std::any_of(texts.begin(), texts.end(), usesUndo) ||
                     std::any_of(request.parts.begin(), request.parts.end(), isStandardInput));
    for (std::string const& file : request.opens)
      if (!runner.runSilently("open " + quotedText(file))) return failureOf(runner);
    runParts(runner, request.parts, texts);
  } catch (FileError const& error) {
    return finished(failed(Status::FileFailed, error.what()), runner.finish());
  }
  status = static_cast<int>(runner.status());
  if (runner.mayGoOn()) {
    for (std::string const& file : request.saves)
      if (!runner.runSilently("save " + quotedText(file)) && status == 0) status = failureOf(runner);
  }
  return finished(status, runner.finish());
}

int showRegistryPage(PluginChoice plugin) {
  // The commands that are there with developer mode only are known by what is missing without it.
  std::set<std::string> forUsers;
  int status = 0;
  plugin.developer = false;
  if (std::unique_ptr<Session> const session = makeSession(plugin, status))
    for (auto const& entry : session->commands().entries())
      forUsers.insert(entry.command->getName().GetString());
  plugin.developer = true;
  std::unique_ptr<Session> const session = status == 0 ? makeSession(plugin, status) : nullptr;
  if (!session) return status;
  std::string const page =
      registryPage(session->commands(), [&](std::string const& name) { return !forUsers.contains(name); });
  return printed(page + "\n");
}

int showCommands(PluginChoice const& plugin, std::string const& name, bool json) {
  int status = 0;
  std::unique_ptr<Session> const session = makeSession(plugin, status);
  if (!session) return status;
  CommandRegistry const& commands = session->commands();
  CommandRegistry::Entry const* entry = nullptr;
  if (!name.empty() && !(entry = commands.find(name)))
    return failed(Status::BadCommandLine, "Unknown command: " + name);
  std::string text;
  if (json) {
    text = jsonText(entry ? boost::json::array{toJson(*entry)} : toJson(commands));
  } else {
    text = entry ? commandPage(*entry) : commandList(commands);
  }
  return printed(text + "\n");
}

int showManPage(PluginChoice const& plugin, std::string const& help) {
  int status = 0;
  std::unique_ptr<Session> const session = makeSession(plugin, status);
  if (!session) return status;
  std::string const page = ".TH TALIX 1 \"\" \"talix " TALIX_VERSION
                           "\"\n.SH NAME\ntalix \\- edits motion capture takes by script\n"
                           ".SH SYNOPSIS\n.B talix\n.I SUBCOMMAND\n[...]\n.SH DESCRIPTION\n.nf\n" +
                           roffText(help) + "\n.fi\n" + manCommands(session->commands());
  return printed(page);
}

int showCompletion(PluginChoice const& plugin, Subcommands const& subcommands) {
  int status = 0;
  std::unique_ptr<Session> const session = makeSession(plugin, status);
  if (!session) return status;
  return printed(bashCompletion(subcommands, session->commands()));
}

}  // namespace talix
