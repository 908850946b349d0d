// One name is a channel's or an attribute's in the whole scene.
#include <gtest/gtest.h>
#include <set>

#include "host/scene/Database.h"
#include "host/scene/PropertyTable.h"
#include "io/Take.h"
#include "io/TakeScene.h"
#include "session/Session.h"

namespace {

class Names : public testing::Test {
 protected:
  Names() { run("newScene"); }
  ~Names() override { g_db->newScene(); }

  // The first log line; "failed" when the line failed without one.
  std::string run(std::string const& line) {
    talix::LineResult const& result = m_session.run(line);
    return !result.log.empty() ? result.log[0].text : result.failed() ? "failed" : "";
  }
  // The name that a channel of a file gets.
  static std::string imported(std::string const& name) {
    talix::Take take;
    take.name = "take";
    take.analog.resize(1);
    take.analog[0].name = name;
    take.analog[0].samples.set(0, {1});
    std::vector<talix::TakeNote> notes;
    talix::importTake(std::move(take), "take.c3d", -1, *g_db, notes);
    Module const* device = g_db->getModuleWithPath("Analog", nullptr, false);
    EXPECT_EQ(device->getNumChannels(), 1);
    EXPECT_EQ(notes.size(), 1u);
    return device->getChannel(0)->getName().GetString();
  }
  static std::string upperCase(std::string name) {
    for (char& c : name)
      if (c >= 'a' && c <= 'z') c = static_cast<char>(c - 0x20);
    return name;
  }

  talix::Session m_session{TALIX_BIN "/TalixDataCommands.so"};
};

constexpr char const* kClasses[] = {
    "Node",          "Marker",       "Character", "LabelingBone",       "SolvingBone",
    "OpticalCamera", "AnalogDevice", "Clip",      "LabelingConstraint", "SolvingConstraint",
    "SystemGroup",   "BlendClip",    "Module",    "LabelingCluster",    "LabelingSetup",
    "SolvingSetup"};

TEST_F(Names, BuiltInOnesOfEveryClass) {
  std::set<std::string> attributes, channels;
  for (char const* name : kClasses)
    if (Module const* module = g_db->createModule(HRuntimeClass::findClass(name), name, nullptr)) {
      for (int i = 0; i < module->getNumAttributes(); ++i)
        attributes.insert(module->getAttribute(i)->getName().GetString());
      for (int i = 0; i < module->getNumChannels(); ++i)
        channels.insert(module->getChannel(i)->getName().GetString());
    }
  EXPECT_EQ(attributes.size(), 18u);
  EXPECT_EQ(channels.size(), 10u);

  run("newScene");  // no module of most classes is there
  run("create AnalogDevice a");
  for (std::string const& name : attributes)
    for (std::string const& given : {name, upperCase(name)}) {
      std::string const wanted = g_db->getModule(0)->getAttribute(given.c_str())
                                     ? "Module a already has a property named " + given + "."
                                     : "\"" + given +
                                           "\" cannot be the name of a channel: it is the name of an "
                                           "attribute.";
      EXPECT_EQ(run("addChannel a " + given + " float"), wanted);
      EXPECT_EQ(Controller::mapPropertyName(HString(given)), 0u);
    }
  channels.insert("FillType");
  for (std::string const& name : channels)
    for (std::string const& given : {name, upperCase(name)}) {
      EXPECT_EQ(run("addAttribute a " + given + " int"),
                "\"" + given + "\" cannot be the name of an attribute: it is the name of a channel.");
      EXPECT_EQ(g_db->getModule(0)->getAttribute(given.c_str()), nullptr);
    }
  for (std::string const& name : attributes) {
    run("newScene");
    EXPECT_EQ(imported(name), name + "_1");
    EXPECT_EQ(run("addChannel Analog " + name + "_1 float"),
              "Module Analog already has a property named " + name + "_1.");
  }
}

}  // namespace
