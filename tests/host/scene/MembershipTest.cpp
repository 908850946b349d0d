// Who is in the scene, who is selected, and that nobody points at what has gone.
#include <algorithm>

#include "host/scene/Constraints.h"
#include "host/scene/Devices.h"
#include "host/scene/SubjectManager.h"
#include "tests/host/scene/SceneFixture.h"

namespace {

struct Item {
  uint32 slot = kNoSlot;
};

TEST(OrderedList, AgreesWithAVector) {
  std::mt19937_64 random(3);
  for (int round = 0; round < 20; ++round) {
    std::vector<Item> items(400);
    std::vector<Item*> model;
    OrderedList<Item, &Item::slot> list;
    size_t const bias = random() % 5 + 3;  // out of ten: how often one is added
    for (int step = 0; step < 2000; ++step) {
      Item* item = &items[random() % items.size()];
      if (list.contains(item)) {
        if (random() % 10 >= bias) {
          ASSERT_EQ(list.indexOf(item), std::find(model.begin(), model.end(), item) - model.begin());
          list.remove(item);
          std::erase(model, item);
        }
      } else if (random() % 10 < bias) {
        list.append(item);
        model.push_back(item);
      }
      if (step % 500 == 499) {
        std::shuffle(model.begin(), model.end(), random);
        std::unordered_map<Item const*, size_t> place;
        for (size_t i = 0; i < model.size(); ++i) place[model[i]] = i;
        list.sort([&](Item const* a, Item const* b) { return place[a] < place[b]; });
      }
      ASSERT_EQ(list.getCount(), static_cast<int>(model.size()));
      if (model.empty()) continue;
      size_t const i = random() % model.size();
      ASSERT_EQ(list.at(static_cast<int>(i)), model[i]);
      ASSERT_EQ(list.indexOf(model[i]), static_cast<int>(i));
    }
    ASSERT_EQ(list.toVector(), model);
    list.clear();
    EXPECT_TRUE(std::none_of(items.begin(), items.end(), [&](Item const& i) { return list.contains(&i); }));
  }
}

class MembershipTest : public SceneTest {};

TEST_F(MembershipTest, SelectionAgreesWithAModel) {
  std::vector<Module*> modules, model;
  for (int i = 0; i < 60; ++i) {
    static constexpr char const* classes[] = {"Marker", "Character", "LabelingBone", "AnalogDevice"};
    modules.push_back(g_db->createModule(HRuntimeClass::findClass(classes[i % 4]), "m", nullptr));
  }
  Module* primary = nullptr;
  auto const kinds = [&](HRuntimeClass const* type) {
    std::vector<Module*> all;
    std::copy_if(model.begin(), model.end(), std::back_inserter(all),
                 [&](Module* m) { return m->isKindOf(type); });
    return all;
  };
  auto const drop = [&](Module* module) {
    std::erase(model, module);
    if (primary == module) primary = model.empty() ? nullptr : model.back();
  };
  for (int step = 0; step < 3000; ++step) {
    Module* module = oneOf(modules);
    switch (below(20)) {
      case 0:
        g_db->selectAllModules(false);
        model.clear();
        primary = nullptr;
        break;
      case 1:
        ASSERT_TRUE(g_db->setPrimarySelectedModule(below(3) ? module : nullptr));
        primary = g_db->getPrimarySelectedModule();
        if (primary && !module->isSelected()) FAIL();
        if (primary && std::find(model.begin(), model.end(), module) == model.end()) model.push_back(module);
        break;
      case 2:
        if (modules.size() < 30) break;
        remove(module);
        drop(module);
        std::erase(modules, module);
        break;
      default:
        if (below(2)) {
          module->setSelected(false);
          drop(module);
        } else {
          if (!module->isSelected()) model.push_back(module), primary = module;
          module->setSelected(true);
        }
    }
    ASSERT_EQ(g_db->getPrimarySelectedModule(), primary);
    ASSERT_EQ(g_db->getNumSelectedModules(), static_cast<int>(model.size()));
    for (int i = 0; i < g_db->getNumSelectedModules(); ++i)
      ASSERT_EQ(g_db->getSelectedModule(i), model[static_cast<size_t>(i)]);
    ASSERT_EQ(g_db->getNumSelectedNodes(), static_cast<int>(kinds(&Node::s_classNode).size()));
    auto const markers = kinds(&Marker::s_classMarker), bones = kinds(&LabelingBone::s_classLabelingBone),
               subjects = kinds(&Character::s_classCharacter);
    ASSERT_EQ(g_db->getNumSelectedMarkers(), static_cast<int>(markers.size()));
    for (size_t i = 0; i < markers.size(); ++i)
      ASSERT_EQ(g_db->getSelectedMarker(static_cast<int>(i)), markers[i]);
    for (size_t i = 0; i <= bones.size(); ++i)
      ASSERT_EQ(g_db->getSelectedLabelingBone(static_cast<int>(i)), i < bones.size() ? bones[i] : nullptr);
    ASSERT_EQ(g_db->getSubjectManager()->getNumSelectedSubjects(), subjects.size());
  }
}

TEST_F(MembershipTest, WhatCannotBeCreatedOrAdded) {
  auto* node = create<Node>("node");
  EXPECT_EQ(g_db->createModule(nullptr, "x", nullptr), nullptr);
  for (int i = 0; i < 31; ++i)
    ASSERT_NE((i % 2 ? static_cast<Module*>(create<Clip>("")) : create<BlendClip>("")), nullptr);
  EXPECT_EQ(create<Clip>(""), nullptr);
  std::unique_ptr<Clip> clip(Clip::createInstance());
  EXPECT_FALSE(g_db->addToScene(clip.get(), true, nullptr, false, false));
  remove(g_db->getHeadClip());
  EXPECT_EQ(g_db->getActiveClip(), nullptr) << "removing the active clip leaves none";
  EXPECT_TRUE(g_db->addToScene(clip.get(), true, nullptr, false, false));
  EXPECT_FALSE(g_db->addToScene(clip.release(), true, nullptr, false, false)) << "it is in already";

  auto* gone = create<Node>("gone");
  remove(gone);
  EXPECT_FALSE(g_db->removeFromScene(gone, true, true, true, true));
  EXPECT_EQ(create<Node>("x", gone), nullptr);
  EXPECT_FALSE(node->addChild(gone));
  EXPECT_FALSE(gone->addChild(node));
  EXPECT_FALSE(g_db->setPrimarySelectedModule(gone));
  g_db->setPrioritySearchModule(gone);
  EXPECT_EQ(g_db->getPriorityModule(), nullptr);
  gone->setSelected(true);
  EXPECT_EQ(g_db->getNumSelectedModules(), 0);
}

TEST_F(MembershipTest, AddingAnInstance) {
  auto* subject = create<Character>("Subject");
  create<Marker>("m", subject);
  Marker* marker = Marker::createInstance();
  marker->setName("m");
  ASSERT_TRUE(g_db->addToScene(marker, true, subject, true, false));
  EXPECT_EQ(marker->getFullPathString(), "\\Subject\\m_1");
  EXPECT_TRUE(marker->isSelected() && !marker->isUnlabeled());
  Marker* twin = Marker::createInstance();
  twin->setName("m");
  ASSERT_TRUE(g_db->addToScene(twin, false, subject, false, false));
  EXPECT_EQ(twin->getName(), "m");
  SolvingConstraint* unnamed = SolvingConstraint::createInstance();
  ASSERT_TRUE(g_db->addToScene(unnamed, false, nullptr, false, false));
  EXPECT_EQ(unnamed->getName(), "SolvingConstraint");
}

TEST_F(MembershipTest, HierarchyRules) {
  auto *subject = create<Character>("S"), *other = create<Character>("T");
  auto *a = create<Marker>("a", subject), *b = create<Marker>("b", a);
  auto* device = create<AnalogDevice>("d", subject);
  EXPECT_FALSE(a->addChild(a));
  EXPECT_FALSE(b->addChild(a)) << "below itself";
  EXPECT_FALSE(subject->addChild(other));
  EXPECT_FALSE(a->removeChild(device, false));
  EXPECT_TRUE(subject->addChild(a)) << "where it is already";
  EXPECT_EQ(subject->getChild(0), a);
  EXPECT_TRUE(b->getCharacterParent() == subject && b->getNodeParent() == a && !b->isUnlabeled());
  auto* c = create<Marker>("a", device);
  EXPECT_EQ(c->getNodeParent(), subject);
  EXPECT_EQ(subject->getNumMarkerChildren(), 1);
  EXPECT_TRUE(subject->addChild(c));
  EXPECT_EQ(subject->getNumMarkerChildren(), 2);
  EXPECT_EQ(subject->getMarkerChild(1), c);
  EXPECT_EQ(subject->getMarkerChild(2), nullptr);
  EXPECT_EQ(subject->findMarkerChild("a"), 0) << "the first child of that name";
  EXPECT_TRUE(subject->removeChild(a, false));
  EXPECT_TRUE(subject->addChild(a));
  EXPECT_EQ(subject->getMarkerChild(subject->findMarkerChild("a")), c) << "by place, not by age";
  EXPECT_EQ(subject->findMarkerChild("d"), -1);
  EXPECT_EQ(other->findMarkerChild("a"), -1);
  EXPECT_EQ(subject->getNumNodeChildren(), 2);
  EXPECT_EQ(subject->getNodeChild(1), a);
  EXPECT_EQ(subject->getSolvingSetup(false), nullptr);
  EXPECT_EQ(subject->getSolvingSetup(true), subject->getSolvingSetup(true));
}

TEST_F(MembershipTest, RemovalLetsGoOfEverything) {
  auto* subject = create<Character>("S");
  auto *marker = create<Marker>("m", subject), *stays = create<Marker>("stays");
  auto *bone = create<SolvingBone>("bone", subject), *outside = create<SolvingBone>("outside");
  auto* constraint = create<SolvingConstraint>("k");
  auto* cluster = create<LabelingCluster>("cluster");
  ASSERT_TRUE(constraint->setSource(marker));
  constraint->setTarget(bone);
  auto* markers = static_cast<MultiModAttribute*>(cluster->getAttribute("Markers"));
  TSimpleArray<Module*> list;
  for (Module* module : {static_cast<Module*>(marker), static_cast<Module*>(stays),
                         static_cast<Module*>(marker), static_cast<Module*>(bone)})
    list.add(module);
  markers->setValue(list, true, true, true, true);
  stays->addConnectingLine(MarkerConnection(marker));
  marker->addConnectingLine(MarkerConnection(stays));
  outside->addConnectingLine(MarkerConnection(outside));
  marker->setSelected(true);
  g_db->setPrioritySearchModule(bone);
  auto* custom = static_cast<ModAttribute*>(
      stays->addCustomAttribute(Attribute::create(Attribute::ModuleReference, "Friend")));
  custom->setValue(marker, true, true, true, true);
  custom->takeAsDefault();
  ControlID id = marker->getID();

  remove(subject);
  EXPECT_EQ(constraint->getSource(), nullptr);
  EXPECT_EQ(constraint->getTarget(), nullptr);
  ASSERT_EQ(markers->getNumModules(), 1);
  EXPECT_EQ(markers->getModuleValue(0), stays);
  EXPECT_FALSE(stays->isConnectedTo(marker));
  EXPECT_EQ(g_db->getNumSelectedModules(), 0);
  EXPECT_EQ(g_db->getPrimarySelectedModule(), nullptr);
  EXPECT_EQ(g_db->getPriorityModule(), nullptr);
  EXPECT_EQ(g_db->getModule(id), nullptr);
  EXPECT_EQ(named("m"), nullptr);
  EXPECT_EQ(g_db->getSubjectManager()->getNumSubjects(), 0u);
  EXPECT_EQ(marker->getName(), "m") << "it lives on until the line ends";
  g_db->releaseRemoved();
  custom->unset(true, true, true);
  EXPECT_EQ(custom->getValue(), nullptr);
  remove(outside);
  EXPECT_EQ(g_db->getNumModules(), 3);
}

TEST_F(MembershipTest, ARemovedClipTakesItsKeysAlong) {
  auto *first = create<Clip>("first"), *second = create<Clip>("second");
  auto* node = create<Node>("node");
  EXPECT_TRUE(first->isActive());
  EXPECT_EQ(first->getNext(), second);
  EXPECT_EQ(second->getNext(), nullptr);
  node->setLocalPos(0, {1, 0, 0});
  g_db->setActiveClip(second);
  node->setLocalPos(0, {2, 0, 0});
  remove(first);
  EXPECT_FALSE(node->hasKeysInClip(first, true));
  EXPECT_TRUE(second->isActive());
  EXPECT_EQ(node->getLocalPos(0).x, 2);
  EXPECT_EQ(g_db->getHeadClip(), second);
  g_db->setActiveClip(first);
  EXPECT_TRUE(second->isActive()) << "a clip that has gone cannot be active";
  remove(second);
  EXPECT_EQ(g_db->getActiveLayer(), -1);
  EXPECT_EQ(node->getLocalPos(0).x, 0);
}

TEST_F(MembershipTest, ANewSceneIsEmptyAndAsNew) {
  create<Clip>("clip");
  auto* node = create<Node>("node");
  node->addChannel("Extra", DataSource::BoolProperty);
  node->setSelected(true);
  g_db->setActiveProperties({1, 2});
  g_db->setAutoUpdateProperties(true);
  g_db->setUpAxis(1);
  g_db->setPrioritySearchModule(node);
  HTimeManager::getInstance()->setTime(7, true);
  g_db->newScene();
  EXPECT_EQ(g_db->getNumModules() + g_db->getNumNodes() + g_db->getNumClips() + g_db->getNumSelectedModules(),
            0);
  EXPECT_EQ(g_db->getNumActiveProperties(), 0);
  EXPECT_TRUE(!g_db->getActiveClip() && !g_db->getPriorityModule() && !g_db->getAutoUpdateProperties());
  EXPECT_EQ(g_db->getUpAxis(), -1);
  EXPECT_EQ(HTimeManager::getInstance()->getTime(), 0);
  EXPECT_EQ(create<Node>("node")->addChannel("Extra", DataSource::FloatProperty)->getNumKeys(), 0)
      << "a channel name's kind is that scene's";
}

TEST_F(MembershipTest, ConnectingLines) {
  auto *hub = create<Marker>("hub"), *a = create<Marker>("a"), *b = create<Marker>("b");
  MarkerConnection red(a);
  red.setConnectingColor({255, 0, 0});
  for (MarkerConnection const& line : {MarkerConnection(a), MarkerConnection(b), red, MarkerConnection()})
    hub->addConnectingLine(line);
  ASSERT_EQ(hub->getNumConnectingLines(), 2);
  EXPECT_EQ(hub->getConnectingLine(0).getConnectingColor(), Vec3(255, 0, 0))
      << "it took the former one's place";
  EXPECT_TRUE(hub->isConnectedTo(b) && !b->isConnectedTo(hub) && !hub->isConnectedTo(nullptr));
  EXPECT_EQ(hub->getConnectionTo(b)->getConnectingColor(), MarkerConnection::getDefaultColor());
  hub->removeConnectingLine(a);
  EXPECT_EQ(hub->getNumConnectingLines(), 1);
  hub->resetAllLines();
  EXPECT_FALSE(hub->isConnectedTo(b));
}

}  // namespace
