#include "tests/plugin/PluginLibrary.h"

#include <charconv>
#include <dlfcn.h>
#include <stdexcept>

#include "host/scene/Database.h"

namespace {

class Lines : public LogSink {
 public:
  void write(LogLevel level, std::string_view text) override {
    lines += std::string(getLogLevelName(level)) + ": " + std::string(text) + "\n";
  }
  std::string lines;
};

std::string textOf(double value) {
  char text[32];
  // Nothing here needs more digits, and rotations come out as whole degrees.
  return {text, std::to_chars(text, text + sizeof text, value, std::chars_format::general, 9).ptr};
}

std::string textOf(Variable const& value) {
  switch (value.getType()) {
    case Variable::None:
      return "nothing";
    case Variable::Int:
      return std::to_string(value.getIntValue(-1));
    case Variable::Float:
      return "float " + textOf(value.getFloatValue(-1));
    case Variable::String:
      return "\"" + std::string(value.getStringValue(-1)) + "\"";
    case Variable::Bool:
      return value.getBoolValue(-1) == Variable::True ? "true" : "false";
    case Variable::Vector: {
      Vec3 const& v = value.getVecValue(-1);
      return "<" + textOf(v.x) + " " + textOf(v.y) + " " + textOf(v.z) + ">";
    }
    default:
      break;
  }
  std::string items;
  for (int i = 0; i < value.getNumItems(); ++i) items += (i ? " " : "") + textOf(value.getArrayValue(i));
  return "[" + items + "]";
}

TArray<Variable> arrayOf(ArgList const& args) {
  TArray<Variable> values;
  for (Arg const& arg : args) values.add(arg);
  return values;
}

CommandOption given(Command const& command, GivenOption const& option) {
  int count = 0;
  Variable::VarType type = Variable::None;
  int const index = command.getOptionSyntax(option.name, count, type);
  if (index < 0) throw std::invalid_argument(std::string("no option ") + option.name);
  CommandOption copy = command.getOption(index);
  for (size_t i = 0; i < option.values.size(); ++i) copy.setArg(static_cast<int>(i), option.values[i]);
  return copy;
}

}  // namespace

std::string PluginLibrary::path() { return TALIX_BIN "/TalixDataCommands.so"; }

PluginLibrary const& PluginLibrary::get() {
  static PluginLibrary const library = [] {
    void* handle = dlopen(path().c_str(), RTLD_NOW | RTLD_LOCAL);
    if (!handle) throw std::runtime_error(dlerror());
    PluginLibrary found{};
    auto const find = [&](auto& function, char const* name) {
      function = reinterpret_cast<std::decay_t<decltype(function)>>(dlsym(handle, name));
      if (!function) throw std::runtime_error(std::string("no ") + name);
    };
    find(found.apiVersion, "apiVersion");
    find(found.isDebug, "isDebug");
    find(found.getNumPlugins, "getNumPlugins");
    find(found.getPlugin, "getPlugin");
    find(found.isVenzo, "isVenzo");
    return found;
  }();
  return library;
}

PluginCommands::PluginCommands(bool developerMode) {
  Database::setDevOnlyMode(developerMode);
  CommandPluginBase* plugin = PluginLibrary::get().getPlugin(0);
  plugin->initialise();
  for (int i = 0; i < plugin->getNumCommands(); ++i) {
    m_commands.push_back(plugin->getCommand(i));
    m_byName[m_commands.back()->getName().GetString()] = m_commands.back();
  }
  plugin->deleteThis();
  Database::setDevOnlyMode(false);
}

PluginCommands::~PluginCommands() {
  for (Command* command : m_commands) command->deleteThis();
}

std::string run(Command& command, ArgList const& args, std::vector<GivenOption> const& options) {
  if (!command.checkArgSyntax(arrayOf(args), {})) return "refused";
  TArray<CommandOption> givenOptions;
  for (GivenOption const& option : options) givenOptions.add(given(command, option));
  Lines sink;
  LogSink* former = setLogSink(&sink);
  Variable result;
  bool const done = command.execute(givenOptions, arrayOf(args), result);
  setLogSink(former);
  return sink.lines + (done                                 ? textOf(result)
                       : result.getType() == Variable::None ? "failed"
                                                            : "failed with a result");
}
