// Copies have all that their originals have, and the relations of the selection become their own.
#include <map>

#include "tests/host/scene/SceneFixture.h"

namespace {

class DuplicationTest : public SceneTest {
 protected:
  // Every kind of custom attribute and channel, references and lines to any module of the scene.
  void furnish(Module* module, std::vector<Module*>& scene) {
    auto const labels = std::make_shared<std::vector<HString> const>(std::vector<HString>{"l", "r", "t"});
    for (int kind = Attribute::Integer; kind <= Attribute::Temperature; ++kind) {
      auto const type = static_cast<Attribute::Type>(kind);
      HString const name = "Custom" + std::to_string(kind);
      module->addCustomAttribute(Attribute::create(type, name, labels));
    }
    auto const at = [&](Attribute::Type type) {
      return module->getAttribute(("Custom" + std::to_string(type)).c_str());
    };
    auto* number = static_cast<IntAttribute*>(at(Attribute::Integer));
    number->setValue(static_cast<int>(below(100)), true, true, true, true);
    number->takeAsDefault();
    number->store(5, below(2) == 0, true);
    static_cast<BitFieldAttribute*>(at(Attribute::BitField))->setValue("r", true, true, true, true, true);
    static_cast<EnumAttribute*>(at(Attribute::Enumeration))->setValue("t", true, true, true, true);
    static_cast<ModAttribute*>(at(Attribute::ModuleReference))
        ->setValue(oneOf(scene), true, true, true, below(2) == 0);
    TSimpleArray<Module*> list;
    for (int i = 0; i < 4; ++i) list.add(oneOf(scene));
    static_cast<MultiModAttribute*>(at(Attribute::MultiModule))->setValue(list, true, true, true, true);
    module->setVisible(below(2) == 0, false);
    static_cast<BoolAttribute*>(module->getAttribute("Locked"))
        ->setValue(below(2) == 0, true, true, true, true);

    module->addChannel("Extra", DataSource::IntProperty);
    for (int i = 0; i < module->getNumChannels(); ++i) {
      Controller* channel = module->getChannel(i);
      channel->setInterpType(static_cast<int>(below(3)));
      channel->setLocked(below(2) == 0);
      channel->setDefaultValues({0.6, 0, 0, 0.8});
      for (NLEClip* clip = g_db->getHeadClip(); clip; clip = clip->getNext())
        for (int layer = 0; layer < clip->getNumLayers(); ++layer) {
          KeyTrack track(Controller::shapeOf(channel->getPropertyType()));
          for (int64 key = 0; key < 3; ++key) track.set(key * kFrame, {uniform(0, 1), 0, 0, 1});
          track.select(0, kFrame);
          if (below(2)) channel->setTrack(clip, layer, std::move(track));
        }
    }
    auto* node = objectAs<Node>(module);
    if (!node) return;
    node->setPreTranslation(randomVec(9));
    node->setPreRotation(randomRotation(), false);
    MarkerConnection line(objectAs<Node>(oneOf(scene)));
    line.setConnectingColor({1, 2, 3});
    node->addConnectingLine(line);
  }

  static void expectSame(Controller const& copy, Controller const& original) {
    EXPECT_NE(copy.getID(), original.getID());
    EXPECT_EQ(copy.getPropertyId(), original.getPropertyId());
    EXPECT_EQ(copy.getDefaultValues(), original.getDefaultValues());
    EXPECT_EQ(copy.getInterpolation(), original.getInterpolation());
    EXPECT_EQ(copy.isLocked(), original.isLocked());
    for (NLEClip* clip = g_db->getHeadClip(); clip; clip = clip->getNext())
      for (int layer = 0; layer < clip->getNumLayers(); ++layer) {
        KeyTrack const *own = copy.findTrack(clip, layer), *theirs = original.findTrack(clip, layer);
        ASSERT_EQ(own == nullptr, theirs == nullptr);
        EXPECT_TRUE(!own || own->sharesAll(*theirs)) << "a snapshot, with its selection";
      }
  }
};

TEST_F(DuplicationTest, CopiesOfRandomScenes) {
  for (int round = 0; round < 20; ++round) {
    g_db->newScene();
    std::vector<Module*> scene;
    create<Clip>("one");
    create<Clip>("two")->addLayer();
    for (size_t i = 0; i < 30; ++i) {
      static constexpr char const* classes[] = {
          "Node", "Marker", "Character", "SolvingBone", "LabelingSetup", "LabelingCluster", "AnalogDevice"};
      Module* parent = i > 0 && below(3) ? oneOf(scene) : nullptr;
      Module* made = g_db->createModule(HRuntimeClass::findClass(classes[below(7)]), "m", parent);
      if (made) scene.push_back(made);
    }
    for (Module* module : scene) module->setName("m" + std::to_string(below(3)));
    for (Module* module : scene) furnish(module, scene);
    std::vector<Module*> originals = scene;
    std::shuffle(originals.begin(), originals.end(), m_random);
    originals.resize(1 + below(originals.size()));
    for (Module* module : originals) module->setSelected(true);
    Module* primary = oneOf(originals);
    g_db->setPrimarySelectedModule(primary);

    g_db->duplicateSelectedObjects();
    ASSERT_EQ(g_db->getNumSelectedModules(), static_cast<int>(originals.size()));
    std::map<Module*, Module*> copies;
    for (int i = 0; i < g_db->getNumSelectedModules(); ++i)
      copies[originals[static_cast<size_t>(i)]] = g_db->getSelectedModule(i);
    auto const counterpart = [&](Module* module) {
      return copies.contains(module) ? copies[module] : module;
    };
    EXPECT_EQ(g_db->getPrimarySelectedModule(), copies[primary]);

    for (auto const& [original, copy] : copies) {
      ASSERT_EQ(copy->getRuntimeClass(), original->getRuntimeClass());
      EXPECT_NE(copy->getID(), original->getID());
      EXPECT_EQ(copy->getParent(), counterpart(original->getParent()));
      std::string const path = copy->getFullPathString().GetString();
      EXPECT_TRUE(copy->getName().GetString().starts_with(original->getName().GetString()));
      for (int i = 0; copy->getParent() && i < copy->getParent()->getNumChildren(); ++i) {
        Module* sibling = copy->getParent()->getChild(i);
        EXPECT_TRUE(sibling == copy || sibling->getName() != copy->getName()) << path;
      }
      ASSERT_EQ(copy->getNumAttributes(), original->getNumAttributes());
      for (int i = 1; i < copy->getNumAttributes(); ++i) {
        Attribute const &own = *copy->getAttribute(i), &theirs = *original->getAttribute(i);
        Attribute::Value expected = theirs.getRawValue();
        if (auto* module = std::get_if<Module*>(&expected)) *module = counterpart(*module);
        if (auto* modules = std::get_if<Attribute::Modules>(&expected))
          for (Module*& module : *modules) module = counterpart(module);
        EXPECT_NE(own.getID(), theirs.getID());
        EXPECT_EQ(own.getName(), theirs.getName());
        EXPECT_EQ(own.isCustom(), theirs.isCustom());
        EXPECT_EQ(own.isSet(), theirs.isSet()) << own.getName().GetStr();
        if (own.getType() == Attribute::MatrixKind || own.getType() == Attribute::Rotation) continue;
        EXPECT_TRUE(own.getRawValue() == expected) << own.getName().GetStr();
        EXPECT_TRUE(own.getRawDefault() == theirs.getRawDefault()) << own.getName().GetStr();
      }
      ASSERT_EQ(copy->getNumChannels(), original->getNumChannels());
      for (int i = 0; i < copy->getNumChannels(); ++i)
        expectSame(*copy->getChannel(i), *original->getChannel(i));
      auto const *node = objectAs<Node>(original), *nodeCopy = objectAs<Node>(copy);
      if (!node) continue;
      EXPECT_EQ(nodeCopy->getPreTranslation(), node->getPreTranslation());
      EXPECT_EQ(nodeCopy->getPreRotation(), node->getPreRotation());
      ASSERT_EQ(nodeCopy->getNumConnectingLines(), node->getNumConnectingLines());
      for (int i = 0; i < node->getNumConnectingLines(); ++i) {
        EXPECT_EQ(nodeCopy->getConnectingLine(i).getTarget(),
                  counterpart(node->getConnectingLine(i).getTarget()));
        EXPECT_EQ(nodeCopy->getConnectingLine(i).getConnectingColor(), Vec3(1, 2, 3));
      }
    }
    // The copies go without harm to the originals.
    for (auto const& [original, copy] : copies) remove(copy);
    g_db->releaseRemoved();
    EXPECT_EQ(g_db->getNumModules(), static_cast<int>(scene.size()) + 2);
  }
}

TEST_F(DuplicationTest, ClipsWithTheirKeysAndLayers) {
  auto* clip = create<Clip>("take");
  auto* marker = create<Marker>("m");
  clip->addLayer();
  clip->setLayerLocked(1, true);
  clip->setSmpteOffset(77);
  marker->setLocalPos(0, {1, 0, 0});
  KeyTrack upper(KeyTrack::Shape::Vector);
  upper.set(0, {10, 0, 0});
  marker->getTranslationChannel()->setTrack(clip, 1, upper);
  static_cast<BoolAttribute*>(marker->getAttribute("Locked"))->setValue(true, true, true, true, true);
  clip->getWeightChannel()->setTrack(clip, 0, [] {
    KeyTrack weight(KeyTrack::Shape::Scalar);
    weight.set(0, {0.5});
    return weight;
  }());
  clip->setSelected(true);
  marker->setSelected(true);
  g_db->duplicateSelectedObjects();
  auto* copy = static_cast<Clip*>(g_db->getSelectedModule(0));
  auto* markerCopy = static_cast<Marker*>(g_db->getSelectedModule(1));
  EXPECT_TRUE(clip->isActive());
  EXPECT_EQ(copy->getNumLayers(), 2);
  EXPECT_TRUE(copy->isLayerLocked(1) && !copy->isLayerLocked(0));
  EXPECT_EQ(copy->getSmpteOffset(), 77);
  EXPECT_TRUE(copy->getWeightChannel()->hasKeysInClip(copy));
  for (NLEClip* active : {clip, copy}) {
    g_db->setActiveClip(active);
    for (Marker* each : {marker, markerCopy}) EXPECT_EQ(each->getLocalPos(0), Vec3(11, 0, 0));
  }
  marker->getTranslationChannel()->setTrack(copy, 1, KeyTrack(KeyTrack::Shape::Vector));
  EXPECT_EQ(marker->getLocalPos(0), Vec3(1, 0, 0));
  g_db->setActiveClip(clip);
  EXPECT_EQ(marker->getLocalPos(0), Vec3(11, 0, 0)) << "the clips have parted";
}

}  // namespace
