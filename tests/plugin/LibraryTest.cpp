// What the library shows to its host: exported names, needed libraries, the plug-in object.
#include <cstdio>
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <memory>
#include <set>
#include <sstream>

#include "tests/plugin/PluginLibrary.h"

namespace {

using testing::Contains;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::Not;
using testing::UnorderedElementsAre;

// The lines that a program prints about the library.
std::vector<std::string> linesOf(std::string const& program) {
  std::unique_ptr<FILE, int (*)(FILE*)> pipe(
      popen((program + " '" + PluginLibrary::path() + "'").c_str(), "r"), &pclose);
  std::vector<std::string> lines;
  char line[1024];
  while (pipe && std::fgets(line, sizeof line, pipe.get())) lines.emplace_back(line);
  return lines;
}

TEST(PluginLibrary, ExportsItsEntryPointsAndNothingElse) {
  std::vector<std::string> names;
  for (std::string const& line : linesOf("nm -D --defined-only")) {
    std::istringstream words(line);
    std::string address, kind, name;
    words >> address >> kind >> name;
    names.push_back(name);
  }
  EXPECT_THAT(names, UnorderedElementsAre("apiVersion", "isDebug", "getNumPlugins", "getPlugin", "isVenzo",
                                          "_ZN23TalixDataCommandsPlugin14createInstanceEv",
                                          "_ZN23TalixDataCommandsPlugin10deleteThisEv"));
}

TEST(PluginLibrary, NeedsTheEngineButNoOtherLayer) {
  std::vector<std::string> needed;
  for (std::string const& line : linesOf("readelf -d"))
    if (line.find("(NEEDED)") != std::string::npos) needed.push_back(line);
  EXPECT_THAT(needed, Contains(HasSubstr("[libTalixCore.so")));
  EXPECT_THAT(needed, Not(Contains(HasSubstr("TalixIO"))));
  EXPECT_THAT(needed, Not(Contains(HasSubstr("TalixSession"))));
  // Loading these would be felt at each start.
  EXPECT_THAT(needed, Not(Contains(HasSubstr("TalixVideo"))));
  EXPECT_THAT(needed, Not(Contains(HasSubstr("[libav"))));
  EXPECT_THAT(needed, Not(Contains(HasSubstr("Qt"))));
}

TEST(PluginLibrary, AnswersItsHost) {
  PluginLibrary const& library = PluginLibrary::get();
  EXPECT_EQ(library.apiVersion(), 524288);
  EXPECT_FALSE(library.isDebug());
  EXPECT_EQ(library.getNumPlugins(), 1);
  EXPECT_FALSE(library.isVenzo());
  EXPECT_EQ(library.getPlugin(1), nullptr);
  EXPECT_EQ(library.getPlugin(-1), nullptr);
}

TEST(PluginObject, SaysWhoItIsAndHoldsNothingBeforeInitialise) {
  CommandPluginBase* plugin = PluginLibrary::get().getPlugin(0);
  CommandPluginBase* another = PluginLibrary::get().getPlugin(0);
  EXPECT_NE(plugin, another);
  std::vector<std::string> const texts = {
      plugin->getVendor().GetString(),    plugin->getAuthor().GetString(),
      plugin->getBuildDate().GetString(), plugin->getInterfaceVersion().GetString(),
      plugin->getName().GetString(),      plugin->getVersion().GetString()};
  EXPECT_THAT(texts, ElementsAre("Norvak", "Norvak", "Jul 11 2024", "1.0", "Talix Data Commands", "2.00"));
  EXPECT_EQ(plugin->getRuntimeClass(), &CommandPluginBase::s_classCommandPluginBase);
  EXPECT_TRUE(plugin->isReady());
  EXPECT_EQ(plugin->getNumCommands(), 0);
  EXPECT_EQ(plugin->getNumControlStreamCommands(), 0);
  EXPECT_EQ(plugin->getNumScriptCommands(), 0);
  EXPECT_EQ(plugin->getNumControlStreamEvents(), 0);
  plugin->deleteThis();
  another->deleteThis();
}

// A command outlives the plug-in object, keeps its one reference through it, and dies with the last one.
TEST(PluginObject, LeavesItsCommandsToTheHost) {
  CommandPluginBase* plugin = PluginLibrary::get().getPlugin(0);
  ASSERT_TRUE(plugin->initialise());
  std::vector<Command*> commands;
  for (int i = 0; i < plugin->getNumCommands(); ++i) commands.push_back(plugin->getCommand(i));
  plugin->deleteThis();

  commands[0]->ref();
  EXPECT_FALSE(commands[0]->unref());
  for (Command* command : commands) EXPECT_TRUE(command->unref());
}

TEST(PluginObject, MakesEverythingAgainWhenInitialisedAgain) {
  CommandPluginBase* plugin = PluginLibrary::get().getPlugin(0);
  plugin->initialise();
  int const once = plugin->getNumCommands();
  plugin->initialise();
  ASSERT_EQ(plugin->getNumCommands(), 2 * once);
  std::set<Command*> different;
  for (int i = 0; i < 2 * once; ++i) different.insert(plugin->getCommand(i));
  plugin->deleteThis();
  EXPECT_EQ(different.size(), static_cast<size_t>(2 * once));
  for (Command* command : different) command->deleteThis();
}

}  // namespace
