// The help of every command: all is explained, and the example line does what it shows.
#include <gtest/gtest.h>
#include <sstream>

#include "session/Session.h"
#include "tests/TempFolder.h"

namespace {

constexpr char const* kScene =
    "newScene;create Clip walk;setPlayRange 0 20;selectTime 5 15;create Character Anna;create LabelingBone "
    "Joint;create SolvingBone Hips -parent Anna;create SolvingBone Knee -parent Hips -preTranslation <0 400 "
    "0>;create SolvingConstraint Pull -parent Hips;create LabelingCluster Cluster;create Marker LFHD RFHD "
    "-parent Anna;setProperty Markers [LFHD RFHD] -onMod Cluster;setMarkerConnection LFHD RFHD;addAttribute "
    "LFHD Sides bitField Left Right;create Marker early late;setKey Translation 9 0 0 -t 0 -all;setKey "
    "Translation 9 0 0 -t 10 -onMod LFHD;setKey Translation 1 2 3 -t 2 -onMod early;setKey Translation 40 0 "
    "0 -t 40 -onMod late;select Joint LFHD;selectChannels Translation;selectKeys";

// What goes before an example where more or others must be selected than a bone and a marker.
constexpr std::string_view kBefore[] = {
    "collapse: create Character Ben;create Marker LFHD -parent Ben;select Anna Ben",
    "copyKeys: select LFHD",
    "createBoneVirts: select Hips",
    "deleteCharacters: select Anna",
    "pack: cutKeys -all;select early late;selectTime 0 0;cutKeys -ranges",
    "parent: select LFHD Knee",
    "pasteKeys: select LFHD;copyKeys",
    "redo: undo",
    "removeNamespace: addNamespace take1",
    "replaceNamespace: addNamespace take1",
    "setBoneLength: select Hips",
    "unpack: select early;selectTime 1 1;cutKeys -ranges"};

TEST(Examples, OfEveryCommandRun) {
  talix_tests::TempFolder const folder;
  std::filesystem::copy(TALIX_TEST_DATA "/walkset_a_le_int.c3d", folder.path("walk.c3d"));
  std::filesystem::copy(TALIX_TEST_DATA "/person_01.mp4", folder.path("walk.mp4"));
  std::filesystem::current_path(folder.path(""));
  Database::setDevOnlyMode(true);
  talix::Session session(TALIX_BIN "/TalixDataCommands.so");
  session.setUndo(true);
  for (auto const& [command, source] : session.commands().entries()) {
    std::string const name = command->getName().GetString(), example = command->getExample().GetString();
    EXPECT_TRUE((example + " ").starts_with(name + " ")) << name;
    EXPECT_TRUE(talix::argSyntax(*command).empty() || !command->getArgsText().IsEmpty()) << name;
    for (int i = 0; i < command->getNumOptions(); ++i) EXPECT_NE(command->getOptionText(i), "") << name;
    std::string lines = kScene;
    for (std::string_view const before : kBefore)
      if (before.starts_with(name + ":")) lines.append(";").append(before.substr(name.size() + 2));
    std::istringstream script(lines + ";" + example);
    for (std::string line; std::getline(script, line, ';');) {
      talix::LineResult const& result = session.run(line);
      bool const remarks = name == "open" || name == "save";
      EXPECT_FALSE(result.failed()) << line;
      for (auto const& said : result.log) EXPECT_TRUE(said.level == LogLevel::Info || remarks) << said.text;
    }
  }
  session.run("newScene");
  Database::setDevOnlyMode(false);
  std::filesystem::current_path("/");
}

}  // namespace
