#include "session/PluginLoader.h"

#include <cstring>
#include <dlfcn.h>
#include <filesystem>
#include <new>

#include "host/command/Command.h"
#include "host/control/ICommandProvider.h"

namespace talix {

namespace {

constexpr char const* kPluginFile = "TalixDataCommands.so";

std::string hex(int number) {
  char text[16];
  std::snprintf(text, sizeof text, "0x%x", static_cast<unsigned>(number));
  return text;
}

// What the system says of the last failure, without the path that it usually begins with.
std::string loadProblem(std::string const& path) {
  char const* text = dlerror();
  std::string problem = text ? text : "unknown reason";
  if (problem.starts_with(path + ": ")) problem.erase(0, path.size() + 2);
  return problem;
}

}  // namespace

PluginLibrary::PluginLibrary(std::string const& path) : m_path(path) {
  // The system's loader searches its own folders for a name without a slash.
  if (m_path.find('/') == std::string::npos) m_path = "./" + m_path;
  std::error_code error;
  if (!std::filesystem::exists(m_path, error)) throw PluginError(path + ": no such plug-in library");
  try {
    load();
  } catch (char const* text) {
    std::string const problem = text;
    unload();
    throw PluginError(path + ": the plug-in could not be made: " + problem);
  } catch (std::bad_alloc const&) {
    unload();
    throw PluginError(path + ": the plug-in could not be made: out of memory");
  } catch (...) {
    unload();
    throw;
  }
}

PluginLibrary::~PluginLibrary() { unload(); }

void PluginLibrary::load() {
  m_library = dlopen(m_path.c_str(), RTLD_NOW | RTLD_LOCAL);
  if (!m_library) throw PluginError(m_path + ": not a library that can be loaded: " + loadProblem(m_path));
  auto const apiVersion = reinterpret_cast<int (*)()>(entryPoint("apiVersion"));
  auto const getNumPlugins = reinterpret_cast<int (*)()>(entryPoint("getNumPlugins"));
  auto const getPlugin = reinterpret_cast<CommandPluginBase* (*)(int)>(entryPoint("getPlugin"));
  int const version = apiVersion();
  if (version != kPluginInterfaceVersion) {
    throw PluginError(m_path + ": made for plug-in interface version " + hex(version) + ", not " +
                      hex(kPluginInterfaceVersion));
  }
  int const count = getNumPlugins();
  for (int i = 0; i < count; ++i) {
    CommandPluginBase* plugin = getPlugin(i);
    if (!plugin) throw PluginError(m_path + ": plug-in " + std::to_string(i) + " could not be made");
    m_plugins.push_back(plugin);
    bool const initialised = plugin->initialise();
    collect(*plugin);
    if (!initialised) {
      throw PluginError(m_path + ": the plug-in " + plugin->getName().GetString() +
                        " could not be initialised");
    }
  }
}

void PluginLibrary::collect(CommandPluginBase const& plugin) {
  // A command or provider that could not be made is null.
  std::string const name = plugin.getName().GetString();
  for (int i = 0; i < plugin.getNumCommands(); ++i)
    if (Command* command = plugin.getCommand(i)) m_commands.push_back({command, name});
  for (int i = 0; i < plugin.getNumControlStreamCommands(); ++i)
    if (auto* provider = plugin.getControlStreamCommand(i)) m_providers.push_back(provider);
}

void PluginLibrary::unload() {
  for (CommandPluginBase* plugin : m_plugins) plugin->deleteThis();
  for (Item const& item : m_commands) item.command->unref();
  for (ControlSystem::ICommandProvider* provider : m_providers) delete provider;
  m_plugins.clear();
  m_commands.clear();
  m_providers.clear();
  if (m_library) dlclose(m_library);
  m_library = nullptr;
}

void* PluginLibrary::entryPoint(char const* name) const {
  void* entry = dlsym(m_library, name);
  if (!entry) throw PluginError(m_path + ": not a command plug-in: it has no entry point " + name);
  return entry;
}

std::string findPlugin(std::string const& programFolder) {
  std::filesystem::path const folder(programFolder);
  std::error_code error;
  for (auto const& place : {folder / kPluginFile, folder.parent_path() / "lib" / "talix" / kPluginFile})
    if (std::filesystem::exists(place, error)) return place.string();
  throw PluginError(std::string(kPluginFile) + " is neither in " + folder.string() + " nor in " +
                    (folder.parent_path() / "lib" / "talix").string());
}

}  // namespace talix
