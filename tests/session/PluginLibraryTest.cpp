#include <filesystem>
#include <fstream>
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "session/PluginLoader.h"
#include "session/Session.h"
#include "tests/TempFolder.h"

namespace talix {
namespace {

std::string sample(std::string const& name) { return std::string(TALIX_BIN) + "/sample/" + name + ".so"; }

std::string problemOf(std::string const& path) {
  try {
    Session const session(path);
  } catch (std::exception const& error) {
    return error.what();
  }
  return "loaded";
}

TEST(PluginLibraryTest, SaysWhyALibraryCannotBeUsed) {
  talix_tests::TempFolder const folder;
  std::string const text = folder.file("plugin_test.so", "no library at all\n");
  auto const because = [](std::string const& path, std::string const& reason) {
    return path + ": " + reason;
  };

  EXPECT_EQ(problemOf("/nowhere/plugin.so"), "/nowhere/plugin.so: no such plug-in library");
  EXPECT_THAT(problemOf(text), testing::StartsWith(because(text, "not a library that can be loaded: ")));
  EXPECT_THAT(problemOf(TALIX_BIN), testing::HasSubstr("not a library that can be loaded: "));
  EXPECT_EQ(
      problemOf(sample("SampleWithoutEntryPoints")),
      because(sample("SampleWithoutEntryPoints"), "not a command plug-in: it has no entry point apiVersion"));
  EXPECT_EQ(problemOf(sample("SampleOld")),
            because(sample("SampleOld"), "made for plug-in interface version 0x70000, not 0x80000"));
  EXPECT_EQ(problemOf(sample("SampleRefuses")),
            because(sample("SampleRefuses"), "the plug-in Sample Commands could not be initialised"));
  EXPECT_EQ(problemOf(sample("SampleThrows")),
            because(sample("SampleThrows"),
                    "the plug-in could not be made: E1224: Out of memory in TSimpleArray::addSpace"));
  EXPECT_EQ(problemOf(sample("SampleClashes")),
            "Two commands are named echo: one of Sample Commands, one of Sample Commands");
}

TEST(PluginLibraryTest, CommandsOfThePluginComeFirstAndNullOnesAreLeftOut) {
  Session const session(sample("Sample"));
  auto const& entries = session.commands().entries();
  ASSERT_FALSE(entries.empty());
  EXPECT_EQ(entries.front().command->getName(), "echo");
  EXPECT_EQ(entries.front().source, "Sample Commands");
  EXPECT_EQ(entries.back().command->getName(), "help");
  EXPECT_EQ(entries.back().source, "host");
  for (auto const& entry : entries) EXPECT_NE(entry.command, nullptr);
}

TEST(PluginLibraryTest, LoadsAgainAfterUnloading) {
  for (int i = 0; i < 3; ++i) {
    Session session(sample("Sample"));
    EXPECT_EQ(session.run("echo 5").value.getIntValue(-1), 5);
  }
}

TEST(PluginLibraryTest, FindsThePluginBesideTheProgramOrInstalled) {
  namespace fs = std::filesystem;
  talix_tests::TempFolder const folder;
  fs::path const root = folder.path("");
  fs::create_directories(root / "bin");
  EXPECT_THROW(findPlugin((root / "bin").string()), PluginError);
  fs::create_directories(root / "lib/talix");
  std::ofstream(root / "lib/talix/TalixDataCommands.so") << "";
  EXPECT_EQ(findPlugin((root / "bin").string()), (root / "lib/talix/TalixDataCommands.so").string());
  std::ofstream(root / "bin/TalixDataCommands.so") << "";
  EXPECT_EQ(findPlugin((root / "bin").string()), (root / "bin/TalixDataCommands.so").string());
}

}  // namespace
}  // namespace talix
