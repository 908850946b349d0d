// The command line: subcommands, options and their help.

#include <CLI/CLI.hpp>
#include <csignal>

#include "app/Completion.h"
#include "app/Info.h"
#include "app/Run.h"
#include "host/base/OutOfMemory.h"

namespace {

using talix::PluginChoice;
using talix::RunRequest;

constexpr int kBadCommandLine = 2;

constexpr char const* kExamples = R"(Examples:
  talix run --open walk.c3d -c 'select -type Marker'
  talix run --open walk.c3d --save clean.c3d clean.talix
  talix run --json -c 'create Marker LFHD' -c getModules
  talix commands setKey
  talix info walk.c3d
)";

constexpr char const* kScriptHelp =
    R"(A script is a text file with one command a line: its name, then values and options in any order.
  # comment
  select LFHD RFHD
  setKey Translation 1 2.5 3 -t 10
  getKeys tx        # the short form of Translation.x
Values: 12  1.5  true  <1 2 3>  [a b c]  "a string"  word. In a string "\" is an ordinary character.
"talix commands" lists all commands, "talix commands NAME" tells all about one.

Results go to standard output, "error:", "warning:" and "info:" lines to standard error. With --json
standard output holds one object a line: file, line, command, ok, result, log.

Ctrl-C cancels an operation that shows its progress, and the line fails; otherwise, and the second time, it
ends the program. Questions are put at a terminal; without one the answer is no.

Exit status: 0 all succeeded, 1 a command failed, 2 the command line is wrong, 3 a file could not be
read or written, 4 out of memory.
)";

void addPluginOptions(CLI::App& app, PluginChoice& plugin) {
  app.add_flag("--dev", plugin.developer, "Offer the commands for developers too");
  app.add_option("--plugin", plugin.file, "Command library to load instead of the program's own")
      ->type_name("FILE");
}

// Options that may be repeated, one value each.
CLI::Option* addRepeatable(CLI::App& app, std::string const& names, std::vector<std::string>& values,
                           std::string const& help) {
  return app.add_option(names, values, help)
      ->allow_extra_args(false)
      ->multi_option_policy(CLI::MultiOptionPolicy::TakeAll);
}

struct RunArguments {
  RunRequest request;
  std::vector<std::string> lines, scripts;
  CLI::Option *lineOption = nullptr, *scriptOption = nullptr;

  // Lines and scripts, brought back into the order in which they were given.
  void putInOrder(CLI::App const& app) {
    auto line = lines.begin();
    auto script = scripts.begin();
    for (CLI::Option const* option : app.parse_order()) {
      if (option == lineOption && line != lines.end()) request.parts.push_back({true, *line++});
      if (option == scriptOption && script != scripts.end()) request.parts.push_back({false, *script++});
    }
  }
};

CLI::App* addRun(CLI::App& app, RunArguments& run) {
  CLI::App* sub = app.add_subcommand("run", "Run scripts and single lines against a scene");
  addRepeatable(*sub, "--open", run.request.opens, "Take to open first (C3D, BVH, TRC); repeatable")
      ->type_name("FILE");
  addRepeatable(*sub, "--save", run.request.saves, "Write the result to FILE (C3D, BVH); repeatable")
      ->type_name("FILE");
  sub->add_flag("--json", run.request.json, "Print one JSON object for each line that is run");
  sub->add_flag("--keep-going", run.request.keepGoing, "Go on after a failed line, and save all the same");
  sub->add_flag("--yes", run.request.assumeYes,
                "Answer yes to every question; else it is put at the terminal");
  run.lineOption = addRepeatable(*sub, "-c", run.lines, "Line to run; repeatable")->type_name("LINE");
  run.scriptOption = sub->add_option("SCRIPT", run.scripts,
                                     "Script files, \"-\" for standard input; run in the order "
                                     "given, together with -c lines")
                         ->type_name("FILE");
  addPluginOptions(*sub, run.request.plugin);
  sub->footer(kScriptHelp);
  return sub;
}

talix::Subcommands subcommandsOf(CLI::App& app) {
  talix::Subcommands all;
  for (CLI::App const* sub : app.get_subcommands({})) {
    std::vector<std::string>& options = all[sub->get_name()];
    for (CLI::Option const* option : sub->get_options()) {
      for (std::string const& name : option->get_lnames()) options.push_back("--" + name);
      for (std::string const& name : option->get_snames()) options.push_back("-" + name);
    }
  }
  return all;
}

}  // namespace

int main(int argc, char** argv) {
  // Whoever stops reading our output makes a write fail; that is reported as such.
  std::signal(SIGPIPE, SIG_IGN);
  endProgramWhenOutOfMemory();

  CLI::App app("talix edits motion capture takes by script, without a window.", "talix");
  app.set_version_flag("--version", "talix " TALIX_VERSION);
  app.require_subcommand(1);
  app.footer(kExamples);

  RunArguments run;
  CLI::App* runApp = addRun(app, run);

  PluginChoice plugin;
  std::string name;
  bool json = false;
  CLI::App* commandsApp = app.add_subcommand("commands", "List the script commands, or tell all about one");
  commandsApp->add_option("NAME", name, "Command to tell about");
  CLI::Option* asJson = commandsApp->add_flag("--json", json, "Print them as a JSON array");
  bool markdown = false;
  commandsApp->add_flag("--markdown", markdown, "Print all about all of them, as docs/commands.md has it")
      ->excludes(asJson);
  bool man = false, completion = false;
  commandsApp->add_flag("--man", man, "Print the manual page of the program, with all commands")
      ->excludes(asJson);
  commandsApp->add_flag("--bash-completion", completion, "Print the completion of the program for bash")
      ->excludes(asJson);
  addPluginOptions(*commandsApp, plugin);

  std::vector<std::string> infoFiles;
  bool infoJson = false;
  CLI::App* infoApp =
      app.add_subcommand("info", "Tell what take files hold, without opening them in a scene");
  infoApp->add_option("FILE", infoFiles, "Take files (C3D, BVH, TRC)")->required();
  infoApp->add_flag("--json", infoJson, "Print it as JSON");

  try {
    app.parse(argc, argv);
  } catch (CLI::ParseError const& error) {
    int const status = app.exit(error);
    return status == 0 ? 0 : kBadCommandLine;
  }
  if (infoApp->parsed()) return talix::runInfo(infoFiles, infoJson);
  if (markdown) return talix::showRegistryPage(plugin);
  if (man)
    return talix::showManPage(plugin, app.get_formatter()->make_help(&app, "talix", CLI::AppFormatMode::All));
  if (completion) return talix::showCompletion(plugin, subcommandsOf(app));
  if (commandsApp->parsed()) return talix::showCommands(plugin, name, json);
  run.putInOrder(*runApp);
  return talix::runScripts(run.request);
}
