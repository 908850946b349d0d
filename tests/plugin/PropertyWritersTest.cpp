// What scripts cannot see of the property and key writers: events, selection flags, values without a reader.
#include <gmock/gmock.h>
#include <typeinfo>
#include <utility>

#include "host/scene/PropertyTable.h"
#include "host/services/HEvent.h"
#include "tests/plugin/SceneFixture.h"

namespace {

using testing::ElementsAre;
using testing::IsEmpty;

class PropertyWriters : public SceneFixture {
 protected:
  PropertyWriters() {
    make<Clip>("take");
    events();
    m_listener = g_eventManager->addListener([this](HEvent const& event) {
      // The class' name after the length that the compiler puts before it.
      m_events.push_back(typeid(event).name() + 2);
    });
  }
  ~PropertyWriters() override {
    g_eventManager->deliverQueued();
    g_eventManager->removeListener(m_listener);
  }

  // The events that waited.
  std::vector<std::string> events() {
    g_eventManager->deliverQueued();
    return std::exchange(m_events, {});
  }
  template <class T>
  T* add(Module* module, Attribute::Type type, char const* name) {
    auto labels = std::make_shared<std::vector<HString> const>(std::vector<HString>{"Left", "Right"});
    return static_cast<T*>(module->addCustomAttribute(Attribute::create(type, name, labels)));
  }

 private:
  std::vector<std::string> m_events;
  int m_listener = 0;
};

TEST_F(PropertyWriters, TellViewsOnceOfKeysThatWereSet) {
  make("n");
  run("setKey", {"Translation", Vec3(1, 2, 3)}, {{"onMod", {"n"}}});
  run("setKey", {"tx", 5}, {{"onMod", {"n"}}});
  EXPECT_THAT(events(), ElementsAre("HControllerSelectionChangedEvent"));
  run("setKey", {"tx", 5}, {{"all"}, {"type", {"Clip"}}});  // succeeds, though nothing is keyed
  EXPECT_THAT(events(), ElementsAre("HControllerSelectionChangedEvent"));

  run("setKey", {"tx", "5"}, {{"onMod", {"n"}}});
  run("setKey", {"tx", 5});
  run("setKey", {"Occluded", true}, {{"onMod", {"n"}}});
  EXPECT_THAT(events(), IsEmpty());
}

TEST_F(PropertyWriters, TellAttributeViewsOfFailuresOnly) {
  Node* node = make("n");
  add<IntAttribute>(node, Attribute::Integer, "Count");
  run("setProperty", {"Count", 5}, {{"onMod", {"n"}}});
  run("setProperty", {"Translation", 5}, {{"onMod", {"n"}}});
  run("setProperty", {"Count", 5}, {{"onMod", {"nobody"}}});
  run("unsetProperty", {"Nothing"}, {{"onMod", {"n"}}});
  run("unsetProperty", {"Count"});
  EXPECT_THAT(events(), IsEmpty());

  for (char const* value : {"five", "six"}) run("setProperty", {"Count", value}, {{"onMod", {"n"}}});
  EXPECT_THAT(events(), ElementsAre("HReloadAttributesEvent"));
  run("setProperty", {"Nothing", 5}, {{"onMod", {"n"}}});
  EXPECT_THAT(events(), ElementsAre("HReloadAttributesEvent"));
  run("setProperty", {"Count", 5});
  EXPECT_THAT(events(), ElementsAre("HReloadAttributesEvent"));
  run("setProperty", {"Nothing", 5}, {{"all"}});
  EXPECT_THAT(events(), ElementsAre("HReloadAttributesEvent"));
}

TEST_F(PropertyWriters, DropActivePropertiesThatNobodyHasWhenTheyFollow) {
  make("n");
  PropertyTable& table = PropertyTable::getInstance();
  g_db->setActiveProperties({table.findId("Threshold") | PropertyTable::kWhole});
  run("setKey", {"tx", 5}, {{"onMod", {"n"}}});
  EXPECT_EQ(g_db->getNumActiveProperties(), 1);
  g_db->setAutoUpdateProperties(true);
  run("setKey", {"tx", "5"}, {{"onMod", {"n"}}});
  EXPECT_EQ(g_db->getNumActiveProperties(), 1);
  run("setKey", {"tx", 5}, {{"onMod", {"n"}}});
  EXPECT_EQ(g_db->getNumActiveProperties(), 0);
  g_db->setAutoUpdateProperties(false);
}

TEST_F(PropertyWriters, LeaveCreatedKeysSelectedOnTheActiveComponents) {
  PropertyTable& table = PropertyTable::getInstance();
  unsigned const translation = table.findId("Translation");
  auto const selectedBy = [&](unsigned bits) {
    Node* node = make("n");
    g_db->selectAllModules(false);
    node->setSelected(true);
    g_db->setActiveProperties({translation | bits});
    run("createKey");
    Controller const* channel = node->getTranslationChannel();
    EXPECT_EQ(channel->getNumKeys(7), bits ? 1 : 0);
    return channel->getNumKeys() ? channel->getSelectedKeyFlags(0) : 8u;
  };
  EXPECT_EQ(selectedBy(PropertyTable::kWhole), 7u);
  EXPECT_EQ(selectedBy(PropertyTable::kX | PropertyTable::kZ), 1u);  // the first of two
  EXPECT_EQ(selectedBy(PropertyTable::kY | PropertyTable::kZ), 2u);
  EXPECT_EQ(selectedBy(PropertyTable::kZ), 4u);
  EXPECT_EQ(selectedBy(0), 8u);
}

TEST_F(PropertyWriters, FillSquareMatrices) {
  auto* grid = add<MatrixAttribute>(make("n"), Attribute::MatrixKind, "Grid");
  for (auto const& [count, rows] : {std::pair{1, 1u}, {3, 1}, {4, 2}, {36, 6}, {37, 6}, {10, 3}}) {
    ArgList args = {"Grid"};
    for (int i = 1; i <= count; ++i) args.push_back(i);
    EXPECT_EQ(run("setProperty", args, {{"onMod", {"n"}}}) == "nothing", count <= 36);
    EXPECT_EQ(grid->getValue().rows(), rows) << count;
  }
  EXPECT_EQ(grid->getValue()[1][0], 4);
  EXPECT_EQ(grid->getValue()[2][2], 9);
}

TEST_F(PropertyWriters, SetAndUnsetEvents) {
  Node* node = make("n");
  auto* button = add<EventAttribute>(node, Attribute::Event, "Go");
  run("setProperty", {"Go", "now", 5}, {{"onMod", {"n"}}});
  EXPECT_TRUE(button->isSet());
  run("unsetProperty", {"Go"}, {{"onMod", {"n"}}});
  EXPECT_FALSE(button->isSet());
}

}  // namespace
