// What the subcommands of the program do. Each returns the program's exit status.
#pragma once

#include <string>
#include <vector>

#include "app/Completion.h"

namespace talix {

// The library whose commands are used: `file` when it is given, else the one that belongs to the program.
struct PluginChoice {
  std::string file;
  bool developer = false;  // with the commands for developers
};

struct RunRequest {
  // A line given on the command line, or a script file ("-": standard input), in the order given.
  struct Part {
    bool isLine;
    std::string text;
  };
  PluginChoice plugin;
  std::vector<std::string> opens, saves;
  std::vector<Part> parts;
  bool json = false, keepGoing = false, assumeYes = false;
};
int runScripts(RunRequest const& request);

// All commands, or the one of that name.
int showCommands(PluginChoice const& plugin, std::string const& name, bool json);
// All commands, those for developers too, as the page that is checked in (session/RegistryPage.h).
int showRegistryPage(PluginChoice plugin);
// The manual page, talix(1). help: what the program says of its subcommands and options.
int showManPage(PluginChoice const& plugin, std::string const& help);
int showCompletion(PluginChoice const& plugin, Subcommands const& subcommands);

}  // namespace talix
