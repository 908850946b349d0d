// The plug-in library as a host sees it: loaded at run time, known by its exported names only.
#pragma once

#include <map>
#include <string>
#include <vector>

#include "host/base/Log.h"
#include "host/command/Command.h"
#include "host/command/CommandPluginBase.h"

// The library's exported names, looked up at first use; it stays loaded.
struct PluginLibrary {
  int (*apiVersion)();
  bool (*isDebug)();
  int (*getNumPlugins)();
  CommandPluginBase* (*getPlugin)(int);
  bool (*isVenzo)();

  static PluginLibrary const& get();
  static std::string path();
};

// The commands of one plug-in object, released as a host does it: the object first, then the commands.
class PluginCommands {
 public:
  explicit PluginCommands(bool developerMode = true);
  ~PluginCommands();
  PluginCommands(PluginCommands const&) = delete;
  PluginCommands& operator=(PluginCommands const&) = delete;

  Command& operator[](std::string const& name) const { return *m_byName.at(name); }

 private:
  std::vector<Command*> m_commands;
  std::map<std::string, Command*> m_byName;
};

// An argument as a script writes it.
struct Arg : Variable {
  Arg(int value) { setValue(value, -1); }
  Arg(double value) { setValue(value, -1); }
  Arg(bool value) { setValue(value ? True : False, -1); }
  Arg(char const* value) { setValue(value, -1); }
  Arg(Vec3 const& value) { setValue(value, -1); }
  Arg(Variable const& value) : Variable(value) {}
};
using ArgList = std::vector<Arg>;

struct GivenOption {
  char const* name;
  ArgList values = {};
};

// Runs a command when it accepts the arguments; returns its log lines, then its result or "failed", a line
// each.
std::string run(Command& command, ArgList const& args = {}, std::vector<GivenOption> const& options = {});
