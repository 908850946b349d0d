// What the commands say about themselves, group by group as users and interfaces meet them.
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <map>
#include <set>
#include <sstream>

#include "host/scene/Database.h"
#include "tests/plugin/PluginLibrary.h"

namespace {

using testing::ElementsAreArray;

std::vector<std::string> listOf(std::string const& text) {
  std::istringstream words(text);
  std::vector<std::string> all;
  for (std::string word; words >> word;) all.push_back(word);
  return all;
}

std::set<std::string> setOf(std::string const& text) {
  const std::vector<std::string> all = listOf(text);
  return {all.begin(), all.end()};
}

// The names of the commands by what `tell` says of each.
template <class Tell>
auto groupsBy(PluginCommands const& commands, Tell tell) {
  std::map<decltype(tell(*commands.inOrder()[0])), std::set<std::string>> groups;
  for (Command* command : commands.inOrder()) groups[tell(*command)].insert(command->getName().GetString());
  return groups;
}

// name(count type):mask, with ! when hidden.
std::string optionsText(Command const& command) {
  static std::map<int, char const*> const types{
      {0, ""}, {1, "int"}, {2, "float"}, {3, "string"}, {5, "vector"}};
  std::ostringstream text;
  for (int i = 0; i < command.getNumOptions(); ++i) {
    CommandOption const& option = command.getOption(i);
    text << (i ? " " : "") << option.getName().GetStr();
    if (option.getArgCount()) text << "(" << option.getArgCount() << " " << types.at(option.getType()) << ")";
    if (!option.getArgCount() && option.getType() != Variable::None) text << "(a type without a value)";
    if (option.getMask()) text << ":" << option.getMask();
    if (option.isHidden()) text << "!";
    EXPECT_EQ(option.getIndex(), i) << command.getName().GetStr();
  }
  return text.str();
}

constexpr char const kBeforeDeveloper[] =
    "collapse copyData copyKeys createBoneVirts create createKey cutKeys delete deleteCharacters duplicate "
    "exists findPlaneCrossing findSelectedKeys getBooleanArrayProperty getBooleanProperty getChannels "
    "getChildren getColor getCount getDistance getEditTool getFloatProperty getIntArrayProperty "
    "getIntProperty getKeys getMarkerConnection getConstraintOffset getLabelingClusterOffsets "
    "getMarkerConnectionColor getModuleRange getModule getModules getModuleType getNumKeys getNumModules "
    "getParent getPosition getPriority getProfileInt getProfileString getProperty getRotation getScale "
    "getSelectedKeys getSelectedTimeRanges getSolversFirst getStringProperty getStringArrayProperty "
    "getTimeCodeOffset getVectorProperty hasKey hide isSelected makeUnique pack parent pasteKeys reduceKeys "
    "removeMarkerConnection setBoneLength setEditTool setInterpType setKey setMarkerConnection setPosition "
    "setPriority unsetProperty setRotation transcodeVideo resample ";
constexpr char const kDeveloper[] =
    "setRotationAngleAxis getRotationAngleAxis setRotationHardy getRotationHardy setRotationHinge "
    "getRotationHinge createLotsOfData ";
constexpr char const kAfterDeveloper[] =
    "setScale setSolversFirst setTimeCodeOffset show unpack unparent wait writeProfileInt "
    "writeProfileString addNamespace removeNamespace replaceNamespace getNamespace getNamespaces ";
constexpr char const kLast[] = "setProperty getRate";

TEST(CommandTable, ListsTheCommandsInOrderWithAndWithoutDeveloperMode) {
  const std::string before = kBeforeDeveloper, after = kAfterDeveloper;
  const auto all = listOf(before + kDeveloper + after + "testSceneReadPerformance " + kLast);
  ASSERT_EQ(all.size(), 94u);
  EXPECT_THAT(PluginCommands(true).names(), ElementsAreArray(all));

  const auto forUsers = listOf(before + after + kLast);
  ASSERT_EQ(forUsers.size(), 86u);
  EXPECT_THAT(PluginCommands(false).names(), ElementsAreArray(forUsers));
}

TEST(CommandTable, GroupsCommandsByCategory) {
  PluginCommands commands;
  auto groups = groupsBy(commands, [](Command const& command) {
    return command.getCategory().GetString() + "/" + command.getSubCategory().GetString();
  });
  EXPECT_EQ(groups.size(), 8u);
  EXPECT_EQ(groups["Data Editing/Data Retrieval"].size(), 39u);
  EXPECT_EQ(groups["Data Editing/Data Manipulators"].size(), 17u);
  EXPECT_EQ(groups["Data Editing/"].size(), 21u);
  EXPECT_EQ(groups["Interface/"], setOf("getEditTool setEditTool setSolversFirst wait"));
  EXPECT_EQ(groups["System/"],
            setOf("getProfileInt getProfileString resample writeProfileInt writeProfileString"));
  EXPECT_EQ(groups["Skeletal Solving/"], setOf("getSolversFirst"));
  EXPECT_EQ(groups["Testing/"], setOf("createLotsOfData testSceneReadPerformance"));
  EXPECT_EQ(groups["Namespace/"],
            setOf("addNamespace removeNamespace replaceNamespace getNamespace getNamespaces"));
}

TEST(CommandTable, ShowsNamesToUsersSomeOfThemTwice) {
  PluginCommands commands;
  auto groups =
      groupsBy(commands, [](Command const& command) { return command.getDisplayName().GetString(); });
  EXPECT_EQ(groups.size(), 94u - 3 - 3 - 1);
  EXPECT_EQ(groups["Set Node Rotation"],
            setOf("setRotation setRotationAngleAxis setRotationHardy setRotationHinge"));
  EXPECT_EQ(groups["Get Node Rotation"],
            setOf("getRotation getRotationAngleAxis getRotationHardy getRotationHinge"));
  EXPECT_EQ(groups["Get Namespace"], setOf("getNamespace getNamespaces"));
  // Names that do not follow from the script name.
  EXPECT_EQ(groups["GetDistance Command"], setOf("getDistance"));
  EXPECT_EQ(groups["Get HString Property"], setOf("getStringProperty"));
  EXPECT_EQ(groups["Get HString Array Property"], setOf("getStringArrayProperty"));
  EXPECT_EQ(groups["Get HString Value From Profile"], setOf("getProfileString"));
  EXPECT_EQ(groups["Write HString Value To Profile"], setOf("writeProfileString"));
  EXPECT_EQ(groups["Get Array Size"], setOf("getCount"));
  EXPECT_EQ(groups["Get Scene Module"], setOf("getModule"));
  EXPECT_EQ(groups["Find Next Selected Keys"], setOf("findSelectedKeys"));
  EXPECT_EQ(groups["Remove Marker Connecting Line"], setOf("removeMarkerConnection"));
}

TEST(CommandTable, TellsAPurposeInOneLineOfEachCommand) {
  std::set<std::string> purposes;
  PluginCommands commands;
  for (Command const* command : commands.inOrder()) {
    const std::string purpose = command->getPurpose().GetString();
    EXPECT_TRUE(purpose.size() > 15 && purpose.size() <= 110 && purpose.back() == '.')
        << command->getName().GetStr() << ": " << purpose;
    EXPECT_TRUE(purposes.insert(purpose).second) << purpose;
  }
}

TEST(CommandTable, ReturnsATypeOfValue) {
  PluginCommands commands;
  auto groups =
      groupsBy(commands, [](Command& command) { return static_cast<int>(command.getReturnType()); });
  EXPECT_EQ(groups[1],
            setOf("copyKeys getCount getEditTool getIntProperty getNumKeys getNumModules getProfileInt "
                  "getTimeCodeOffset setEditTool"));
  EXPECT_EQ(groups[2], setOf("getDistance getFloatProperty getProperty getRate"));
  EXPECT_EQ(groups[3], setOf("getModule getModuleType getNamespace getParent getPriority getProfileString "
                             "getStringProperty"));
  EXPECT_EQ(groups[4],
            setOf("exists getBooleanProperty getMarkerConnection getSolversFirst hasKey isSelected "
                  "writeProfileInt writeProfileString"));
  EXPECT_EQ(groups[5], setOf("getConstraintOffset getPosition getRotation getRotationAngleAxis getScale "
                             "getVectorProperty"));
  EXPECT_EQ(groups[17], setOf("getColor getIntArrayProperty getKeys getMarkerConnectionColor getModuleRange "
                              "getSelectedKeys getSelectedTimeRanges"));
  EXPECT_EQ(groups[19], setOf("createBoneVirts getChannels getChildren getModules getNamespaces "
                              "getStringArrayProperty"));
  EXPECT_EQ(groups[20], setOf("getBooleanArrayProperty"));
  EXPECT_EQ(groups[21], setOf("getLabelingClusterOffsets"));
  EXPECT_EQ(groups[0].size(), 45u);
  EXPECT_EQ(groups.size(), 10u);
}

TEST(CommandTable, SaysWhatCannotRunAlone) {
  PluginCommands commands;
  auto groups = groupsBy(commands, [](Command const& command) { return command.canExecuteSolo(); });
  // Those that can run alone; the rest need arguments, but for some that merely say so.
  EXPECT_EQ(
      groups[true],
      setOf(
          "collapse copyKeys createBoneVirts createKey cutKeys delete deleteCharacters duplicate "
          "findPlaneCrossing findSelectedKeys getChannels getEditTool getModule getModules getNumModules "
          "getPriority getRate getSelectedTimeRanges getSolversFirst getTimeCodeOffset hide makeUnique pack "
          "parent pasteKeys reduceKeys setBoneLength setPriority setSolversFirst setTimeCodeOffset show "
          "testSceneReadPerformance transcodeVideo unpack unparent wait"));
  EXPECT_EQ(groups[false].size(), 58u);
}

TEST(CommandTable, DeclaresOptions) {
  PluginCommands commands;
  auto groups = groupsBy(commands, optionsText);
  EXPECT_EQ(groups[""].size(), 34u);
  EXPECT_EQ(
      groups["onMod(1 string)"],
      setOf(
          "getKeys getSelectedKeys setInterpType addNamespace removeNamespace replaceNamespace getNamespace "
          "getNamespaces"));
  EXPECT_EQ(groups["c d"],
            setOf("getBooleanProperty getFloatProperty getIntProperty getProperty getVectorProperty"));
  EXPECT_EQ(groups["file(1 string)"],
            setOf("getProfileInt getProfileString writeProfileInt writeProfileString"));
  EXPECT_EQ(groups["all:2 ranges:1"], setOf("copyKeys reduceKeys"));
  EXPECT_EQ(groups["adjust:8 showProgress ranges adjustOnly:1"], setOf("parent unparent"));
  EXPECT_EQ(groups["fullPath:2 nameOnly:1"], setOf("getModule getParent"));

  // Masks that name the other option, and those that do not.
  const std::map<std::string, std::string> single{
      {"getPosition", "ws:2 inSpaceOf(1 string):1 preTrans:8 default:4"},
      {"getRotationAngleAxis", "ws:2 inSpaceOf(1 string):1 preRot:8 def:4"},
      {"getScale", "ws inSpaceOf(1 string):1 def"},
      {"setScale", "ws def"},
      {"setPosition", "ws preTrans:4 default:2"},
      {"setRotation", "ws preRot:4 def:2"},
      {"getDistance", "avg:1 min:2 max:4 range:8 sd:16 rangesOnly:32 mustHaveKeys:64"},
      {"hasKey", "selected:8 seconds(1 int):12 frame(1 int):10 allTime:6 any"},
      {"getModules", "type(1 string) primary:4 selected:2 fullPath:16 nameOnly:8"},
      {"getChildren", "nodesOnly fullPath:4 nameOnly:2"},
      {"hide", "s:6! u:5 primary:3 t all:6!"},
      {"delete", "all:2 primary:1"},
      {"cutKeys", "all:2 ranges:1 allLayers onMod(1 string)"},
      {"setKey", "t(1 int) r all onMod(1 string):16 type(1 string):8"},
      {"setProperty", "c! r all onMod(1 string):16 type(1 string):8 d"},
      {"unsetProperty", "all onMod(1 string):4 type(1 string):2"},
      {"resample", "selected! ignoreGaps includeUnlabeledMarkers"},
      {"create",
       "addSelect parent(1 string) positionOffset(1 vector) rotationOffset(1 vector) "
       "preTranslation(1 vector) preRotation(1 vector) allClips multiple(1 int)"},
      {"pack", "minGap(1 int) minDistance(1 float) marker(1 string)"},
      {"setMarkerConnection", "color(3 int) priorityOnly"},
      {"getNumKeys", "s onMod(1 string)"},
      {"transcodeVideo",
       "videoPayload(1 string) audioPayload(1 string)! quality(1 int) timecodeOverlay "
       "timecodeOverlayPosition(1 "
       "string) timecodeOverlaySize(1 string) overrideSaturation(1 float) overrideGammaCorrection(1 float) "
       "correctForLensDistortion backupOriginalFile removeAudio shiftPrincipalPointToCentre"}};
  for (auto const& [name, options] : single) EXPECT_EQ(optionsText(commands[name]), options) << name;
}

TEST(CommandTable, ShowsArgumentSyntaxWhateverTheScene) {
  PluginCommands commands;
  const auto syntax = [](Command const& command) {
    HString text = "former text";
    command.getArgSyntaxString(text);
    return text.GetString();
  };
  auto groups = groupsBy(commands, syntax);
  EXPECT_EQ(groups[""].size(), 34u);
  EXPECT_EQ(
      groups["moduleName propertyName"],
      setOf("getBooleanArrayProperty getBooleanProperty getFloatProperty getIntArrayProperty getIntProperty "
            "getProperty getStringArrayProperty getStringProperty getVectorProperty"));
  EXPECT_EQ(groups["propertyName"], setOf("getKeys getNumKeys getSelectedKeys unsetProperty"));
  EXPECT_EQ(groups["\"moduleName\""], setOf("getPosition getRotation getRotationAngleAxis getScale"));
  EXPECT_EQ(groups["moduleName"], setOf("getModuleType"));
  EXPECT_EQ(groups["module"], setOf("getParent isSelected"));
  EXPECT_EQ(groups["array"], setOf("getCount"));
  EXPECT_EQ(groups["selected | primarySelected | default | markerLines"], setOf("getColor"));
  EXPECT_EQ(groups["'numMarkers, NumFrames'"], setOf("createLotsOfData"));
  EXPECT_EQ(groups["'LabelingCluster name'"], setOf("getLabelingClusterOffsets"));
  EXPECT_EQ(groups["moduleType \"name1\" [\"name2\"] ..."], setOf("create"));
  EXPECT_EQ(groups["\"sourceNode\" [\"targetNode1\" \"targetNode2\"...]"], setOf("removeMarkerConnection"));
  EXPECT_EQ(groups["[\"name1\" \"name2\" ...]"], setOf("hide"));
  EXPECT_EQ(groups["\"sectionHeader\" \"entry\" \"defaultValue\""], setOf("getProfileString"));

  Module* node = g_db->createModule(&Node::s_classNode, "node", nullptr);
  node->setSelected(true);
  EXPECT_EQ(groupsBy(commands, syntax), groups);
  g_db->newScene();
}

}  // namespace
