// Command plug-in libraries, loaded at run time and known by their entry points only:
//
//   int apiVersion()   int getNumPlugins()   CommandPluginBase* getPlugin(int index)
#pragma once

#include <stdexcept>
#include <string>
#include <vector>

#include "host/command/CommandPluginBase.h"

namespace talix {

// One sentence that names the library and why it cannot be used.
class PluginError : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
};

// A loaded library. Its commands and providers live as long as this object; it ends the plug-in objects
// first, then releases what they made, then unloads the library.
class PluginLibrary {
 public:
  // Loads and initialises. Throws PluginError, with nothing left loaded.
  explicit PluginLibrary(std::string const& path);
  ~PluginLibrary();
  PluginLibrary(PluginLibrary const&) = delete;
  PluginLibrary& operator=(PluginLibrary const&) = delete;

  struct Item {
    Command* command;
    std::string source;  // the name of its plug-in
  };
  std::vector<Item> const& commands() const { return m_commands; }
  std::vector<ControlSystem::ICommandProvider*> const& providers() const { return m_providers; }

 private:
  void load();
  void collect(CommandPluginBase const& plugin);
  void unload();
  void* entryPoint(char const* name) const;

  std::string m_path;
  void* m_library = nullptr;
  std::vector<CommandPluginBase*> m_plugins;
  std::vector<Item> m_commands;
  std::vector<ControlSystem::ICommandProvider*> m_providers;
};

// The program's own plug-in: beside the program, or where it is installed (../lib/talix). Throws PluginError
// naming both places when it is in neither.
std::string findPlugin(std::string const& programFolder);

}  // namespace talix
