// A small command plug-in for the tests of the session: commands that answer what they were given, that make
// and show things in the scene, and that fail in every way there is.

#include <csignal>
#include <initializer_list>
#include <new>

#include "host/base/TSimpleArray.h"
#include "host/command/CommandPluginBase.h"
#include "host/command/ScriptCommand.h"
#include "host/scene/Database.h"
#include "host/services/HInterface.h"
#include "host/services/OperationStack.h"

namespace {

// Transcripts name modules that exist.
Module* moduleAt(Variable const& path) {
  return g_db->getModuleWithPath(path.getStringValue(-1), nullptr, false);
}

// Answers its only argument; its options are of every type.
class EchoCmd final : public ScriptCommand<EchoCmd> {
 public:
  static constexpr CommandInfo info = {.name = "echo",
                                       .displayName = "Echo",
                                       .category = "Testing",
                                       .subCategory = "Data Retrieval",
                                       .purpose = "The value, or that of the last option.",
                                       .args = {"[value]", 0, 1},
                                       .options = {{"int", 1, Variable::Int},
                                                   {"float", 1, Variable::Float},
                                                   {"string", 1, Variable::String},
                                                   {"bool", 1, Variable::Bool},
                                                   {"vector", 1, Variable::Vector},
                                                   {"three", 3, Variable::Int},
                                                   {"a", 0, Variable::None, 0b10000000},
                                                   {"b", 0, Variable::None, 0b01000000},
                                                   {"oneSided", 0, Variable::None, 0b01000000},
                                                   {"secret", 0, Variable::None, 0, true}}};

  bool execute(Given const& given, Args const& args, Variable& result) override {
    if (args.getCount() > 0) result = args[0];
    if (given.getCount() > 0) result = given[given.getCount() - 1].getArg(0);
    return true;
  }
};

// Says the types and values of its arguments.
class TypesCmd final : public ScriptCommand<TypesCmd> {
 public:
  static constexpr CommandInfo info = {.name = "types",
                                       .displayName = "Types",
                                       .category = "Testing",
                                       .args = {"value ...", 0, ArgsInfo::kAny},
                                       .returns = Variable::IntArray};

  bool execute(Given const&, Args const& args, Variable& result) override {
    result = Variable(Variable::IntArray, args.getCount());
    for (int i = 0; i < args.getCount(); ++i) result.setValue(static_cast<int>(args[i].getType()), i);
    return true;
  }
};

class MakeCmd final : public ScriptCommand<MakeCmd> {
 public:
  static constexpr CommandInfo info = {.name = "make",
                                       .displayName = "Make Module",
                                       .category = "Testing",
                                       .args = {"class name [parent]", 2, 3, {}, Variable::String}};

  bool execute(Given const&, Args const& args, Variable&) override {
    HRuntimeClass* type = HRuntimeClass::findClass(args[0].getStringValue(-1));
    Module* parent = args.getCount() > 2 ? moduleAt(args[2]) : nullptr;
    if (g_db->createModule(type, args[1].getStringValue(-1), parent)) return true;
    logError("Cannot make %s", args[1].getStringValue(-1));
    return false;
  }
};

// The selected modules; the primary one last, after a blank name.
class SelectionCmd final : public ScriptCommand<SelectionCmd> {
 public:
  static constexpr CommandInfo info = {.name = "selection",
                                       .displayName = "Get Selection",
                                       .category = "Testing",
                                       .returns = Variable::StringArray};

  bool execute(Given const&, Args const&, Variable& result) override {
    int const count = g_db->getNumSelectedModules();
    Module const* primary = g_db->getPrimarySelectedModule();
    result = Variable(Variable::StringArray, primary ? count + 2 : count);
    for (int i = 0; i < count; ++i)
      result.setValue(g_db->getSelectedModule(i)->getPath(Module::ShortestPath).GetStr(), i);
    if (primary) result.setValue(primary->getPath(Module::ShortestPath).GetStr(), count + 1);
    return true;
  }
};

// The active properties, each with its component bits.
class ChannelsCmd final : public ScriptCommand<ChannelsCmd> {
 public:
  static constexpr CommandInfo info = {.name = "channels",
                                       .displayName = "Get Active Properties",
                                       .category = "Testing",
                                       .returns = Variable::StringArray};

  bool execute(Given const&, Args const&, Variable& result) override {
    result = Variable(Variable::StringArray, g_db->getNumActiveProperties());
    for (int i = 0; i < g_db->getNumActiveProperties(); ++i) {
      unsigned const id = g_db->getActiveProperty(i);
      result.setValue((Controller::mapPropertyId(id).GetString() + ":" + std::to_string(id >> 28)).c_str(),
                      i);
    }
    return true;
  }
};

// Logs at every level, then fails as it is told.
class FailCmd final : public ScriptCommand<FailCmd> {
 public:
  static constexpr CommandInfo info = {.name = "fail",
                                       .displayName = "Fail",
                                       .category = "Testing",
                                       .options = {{"text"}, {"memory", "runs out of memory"}, {"deselect"}}};

  bool execute(Given const& given, Args const&, Variable& result) override {
    result.setValue(1, -1);
    if (GivenOptions(given).has(info.option("deselect"))) g_db->selectAllModules(false);
    if (GivenOptions(given).has(info.option("text"))) throw "E1224: Out of memory in TSimpleArray::addSpace";
    if (GivenOptions(given).has(info.option("memory"))) throw std::bad_alloc();
    logInfo("about to fail");
    logWarning("100%% sure");
    logError("failed");
    return false;
  }
};

// Works on a task and presses Ctrl-C so often meanwhile; fails when that cancels it.
class WorkCmd final : public ScriptCommand<WorkCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "work",
      .displayName = "Work",
      .category = "Testing",
      .args = {"caption interrupts", 2, 2, {Variable::String, Variable::Int}}};

  bool execute(Given const&, Args const& args, Variable&) override {
    g_theOperationStack.pushTask(0, 4, 1, 1, true, args[0].getStringValue(-1));
    for (int i = 0; i < args[1].getIntValue(-1); ++i) std::raise(SIGINT);
    if (g_theOperationStack.isCancelled()) return false;
    g_theOperationStack.popTask();
    return true;
  }
};

class AskCmd final : public ScriptCommand<AskCmd> {
 public:
  static constexpr CommandInfo info = {.name = "ask",
                                       .displayName = "Ask",
                                       .category = "Testing",
                                       .args = {"question", 1, 1, {Variable::String}}};

  bool execute(Given const&, Args const& args, Variable& result) override {
    result.setValue(g_interface->askQuestion(args[0].getStringValue(-1), 1), -1);
    return true;
  }
};

class SamplePlugin final : public CommandPluginBase {
 public:
  HString getVendor() const override { return "Talix"; }
  HString getAuthor() const override { return "Talix"; }
  HString getBuildDate() const override { return ""; }
  HString getInterfaceVersion() const override { return "1.0"; }
  HString getName() const override { return "Sample Commands"; }
  HString getVersion() const override { return "1.0"; }
  bool isReady() const override { return true; }
  int getNumCommands() const override { return m_commands.getCount(); }
  Command* getCommand(int index) const override { return m_commands[index]; }

  bool initialise() override {
    for (Command* command :
         std::initializer_list<Command*>{new EchoCmd, new TypesCmd, new MakeCmd, new SelectionCmd,
                                         new ChannelsCmd, new FailCmd, new WorkCmd, new AskCmd})
      m_commands.add(command);
    m_commands.add(nullptr);  // one that could not be made
#ifdef SAMPLE_CLASHES
    m_commands.add(new EchoCmd);
#endif
#ifdef SAMPLE_REFUSES
    return false;
#else
    return true;
#endif
  }

 private:
  TSimpleArray<Command*> m_commands;
};

}  // namespace

#ifndef SAMPLE_VERSION
#define SAMPLE_VERSION kPluginInterfaceVersion
#endif

extern "C" {
#ifndef SAMPLE_WITHOUT_ENTRY_POINTS
int apiVersion() { return SAMPLE_VERSION; }
int getNumPlugins() { return 1; }
CommandPluginBase* getPlugin(int index) {
#ifdef SAMPLE_THROWS
  throw "E1224: Out of memory in TSimpleArray::addSpace";
#endif
  return index == 0 ? new SamplePlugin : nullptr;
}
#endif
}
