// Channels: names, kinds, layers, clips, locks and edits.
#include <limits>

#include "host/scene/Devices.h"
#include "host/scene/PropertyTable.h"
#include "tests/host/scene/SceneFixture.h"

namespace {

constexpr double kNan = std::numeric_limits<double>::quiet_NaN();

class ControllerTest : public SceneTest {
 protected:
  template <class T>
  T* channel(char const* name, DataSource::PropertyType type) {
    return objectAs<T>(static_cast<HObject*>(m_node->addChannel(name, type)));
  }
  static HString fixed(char const* text) {
    HString name(text);
    Controller::fixChannelStr(name);
    return name;
  }

  Clip* m_clip = create<Clip>("clip");
  Node* m_node = create<Node>("node");
};

TEST_F(ControllerTest, NamesAreMended) {
  m_node->addChannel("sx", DataSource::FloatProperty);
  m_node->addChannel("force", DataSource::FloatProperty);
  m_node->addChannel("Force", DataSource::FloatProperty);
  for (auto const& [given, wanted] : std::initializer_list<std::pair<char const*, char const*>>{
           {"tx", "Translation.x"},
           {"RY", "Rotation.y"},
           {"sz", "Scale.z"},
           {"sx", "sx"},  // a channel of that very name
           {"tw", "tw"},
           {" \ttranslation \n", "Translation"},
           {"TRANSLATION.y", "Translation.y"},
           {"translation.Q", "Translation.Q"},
           {"occluded", "Occluded"},
           {"Force", "Force"},
           {"FORCE", "FORCE"},  // two fit
           {"unheard.Of", "unheard.Of"},
           {"", ""},
           {"  ", ""},
           {".x", ".x"},
       })
    EXPECT_EQ(fixed(given), wanted) << given;
}

TEST_F(ControllerTest, AChannelNameHasOneKindEverywhere) {
  auto* other = create<AnalogDevice>("other");
  Controller* channel = m_node->addChannel("Force", DataSource::Vec3Property);
  ASSERT_NE(channel, nullptr);
  EXPECT_EQ(m_node->addChannel("Force", DataSource::Vec3Property), channel);
  EXPECT_EQ(other->addChannel("Force", DataSource::FloatProperty), nullptr);
  EXPECT_EQ(other->addChannel("Translation", DataSource::RotProperty), nullptr);
  EXPECT_EQ(other->getChannel("Translation"), nullptr) << "known, but this module has none";
  unsigned const id = Controller::mapPropertyName("Force");
  EXPECT_EQ(Controller::mapPropertyId(id | PropertyTable::kY), "Force");
  EXPECT_EQ(Controller::mapToPropertyType(id | PropertyTable::kWhole), DataSource::Vec3Property);
  EXPECT_EQ(m_node->getProperty(id | PropertyTable::kX), channel);
  EXPECT_EQ(m_node->getChannel(channel->getID()), channel);
  EXPECT_EQ(Controller::mapPropertyName("force"), 0u);
  EXPECT_EQ(Controller::mapToPropertyType("Force.x"), DataSource::NoProperty);
  EXPECT_TRUE(Controller::mapPropertyId(0).IsEmpty() && Controller::mapPropertyId(9999).IsEmpty());
  g_db->setActiveProperties({id | PropertyTable::kX, Controller::mapPropertyName("Residual")});
  g_db->syncActiveProperties(true);
  EXPECT_EQ(g_db->getNumActiveProperties(), 1) << "no module has a residual";
}

TEST_F(ControllerTest, LockedLayersKeepTheirKeys) {
  auto* length = channel<FloatController>("Length", DataSource::FloatProperty);
  m_clip->addLayer();
  m_clip->setLayerLocked(1, true);
  m_clip->setLayerLocked(7, true);
  EXPECT_TRUE(length->isEditable());
  for (int layer = 0; layer < 2; ++layer) {
    KeyTrack keys(KeyTrack::Shape::Scalar);
    keys.set(0, {1});
    length->setTrack(m_clip, layer, keys);
  }
  EXPECT_EQ(length->deleteKeys(HTimeRange::forever(), KeyTrack::kAll, true), 1)
      << "the locked layer keeps its key";
  g_db->setActiveLayer(1);
  EXPECT_EQ(length->getNumKeys(), 1);
  EXPECT_FALSE(length->isEditable());
  EXPECT_FALSE(g_db->setActiveLayer(2));
  EXPECT_FALSE(g_db->setActiveLayer(-1));
}

TEST_F(ControllerTest, LayersAddUp) {
  auto* length = channel<FloatController>("Length", DataSource::FloatProperty);
  auto* place = channel<Vec3Controller>("Place", DataSource::Vec3Property);
  auto* turn = channel<RotController>("Turn", DataSource::RotProperty);
  auto* flag = channel<BoolController>("Flag", DataSource::BoolProperty);
  m_clip->addLayer();
  m_clip->addLayer();
  length->setConstValue(100, true);
  EXPECT_EQ(length->getValue(0), 100);
  double sum = 0;
  Vec3 places;
  TalixRotation turns;
  for (int layer = 0; layer < 3; ++layer) {
    ASSERT_TRUE(g_db->setActiveLayer(layer));
    length->setKey(0, layer + 1, 7);
    place->setKey(0, Vec3(layer, 1, 0), layer == 1 ? 1 : 7);
    TalixRotation const own = randomRotation();
    turn->setKey(0, own, 7);
    flag->setKey(0, layer == 2, 7);
    sum += layer + 1;
    places += Vec3(layer, layer == 1 ? 0 : 1, 0);
    turns *= own;
    EXPECT_EQ(length->getValue(50), sum);
    EXPECT_EQ(place->getValue(50), places);
    EXPECT_LT((turn->getValue(50).rotate({1, 2, 3}) - turns.rotate({1, 2, 3})).length(), 1e-12);
    EXPECT_EQ(flag->getValue(50), layer == 2);
  }
  // A layer is asked to make the sum right, whatever lies above it.
  for (int layer = 0; layer < 3; ++layer) {
    g_db->setActiveLayer(layer);
    TalixRotation const wanted = randomRotation();
    KeyTrack::Values raw{};
    wanted.getQuaternion(raw.data());
    turn->writeKeyAt(0, turn->solveLayer(0, raw), 7);
    length->writeKeyAt(0, length->solveLayer(0, {-3}), 7);
    EXPECT_LT((turn->getValue(0).rotate({1, 2, 3}) - wanted.rotate({1, 2, 3})).length(), 1e-12);
    EXPECT_EQ(length->getValue(0), -3);
  }
  g_db->setActiveLayer(0);
  EXPECT_EQ(length->deleteKeys(HTimeRange::forever(), 7, false), 1);
  EXPECT_EQ(length->deleteKeys(HTimeRange::forever(), 7, true), 2);
  EXPECT_EQ(length->getValue(0), 100);
}

TEST_F(ControllerTest, BlendsAreWeightedMeans) {
  auto* second = create<Clip>("second");
  auto* blend = create<BlendClip>("blend");
  auto* length = channel<FloatController>("Length", DataSource::FloatProperty);
  auto* turn = channel<RotController>("Turn", DataSource::RotProperty);
  length->setKey(0, 10, 7);
  turn->setKey(0, TalixRotation({0.2, 0, 0}), 7);
  g_db->setActiveClip(second);
  length->setKey(0, 20, 7);
  double const turned[4] = {-std::sin(0.2), 0, 0, -std::cos(0.2)};  // the same rotation's other sign
  TalixRotation other;
  other.setQuaternion(turned);
  turn->setKey(0, other, 7);
  g_db->setActiveClip(blend);
  TSimpleArray<Module*> sources;
  for (Module* module : std::initializer_list<Module*>{m_clip, nullptr, m_node, blend, second})
    sources.add(module);
  blend->getSources()->setValue(sources, true, true, true, true);
  EXPECT_EQ(length->getValue(0), 15);
  Vec3 angle;
  turn->getValue(0).getAsVector(angle);
  EXPECT_NEAR(angle.x, 0.3, 1e-3);
  second->getWeightChannel()->setConstValue(-1, true);
  EXPECT_EQ(length->getValue(0), 10);
  m_clip->getWeightChannel()->setConstValue(0, true);
  length->setConstValue(7, true);
  EXPECT_EQ(length->getValue(0), 7) << "no source counts";
}

TEST_F(ControllerTest, KeysOfComponents) {
  auto* place = m_node->getTranslationChannel();
  place->setComponentKey(10, 5, 2);
  place->setKey(20, {1, 2, 3}, 7);
  EXPECT_EQ(place->getNumKeys(1), 1);
  EXPECT_TRUE(place->keyHasComponents(0, 2) && !place->keyHasComponents(0, 7));
  EXPECT_EQ(place->getComponentValue(10, 1), 1) << "x is keyed at 20 only";
  EXPECT_EQ(place->getKeyRange(), HTimeRange(10, 20));
  EXPECT_EQ(m_node->getDataRange(), HTimeRange(10, 20));
}

TEST_F(ControllerTest, UnsoundNumbersGoNowhere) {
  auto* length = channel<FloatController>("Length", DataSource::FloatProperty);
  length->setConstValue(kNan, true);
  length->setKey(0, std::numeric_limits<double>::infinity(), 7);
  EXPECT_TRUE(length->getNumKeys() == 0 && length->getConstValue() == 0);
  auto* place = m_node->getTranslationChannel();
  EXPECT_FALSE(place->setConstValue({kNan, 0, 0}, true, false));
  place->setKey(0, {kNan, 2, kNan}, 2);
  EXPECT_EQ(place->getNumKeys(), 1) << "the bad components were not meant";
  auto* count = channel<IntController>("Count", DataSource::IntProperty);
  count->setDefaultValues({1e300});
  EXPECT_EQ(count->getConstValue(), INT32_MAX);
  EXPECT_EQ(count->getValue(0), INT32_MAX);
}

TEST_F(ControllerTest, Interpolation) {
  auto* count = channel<IntController>("Count", DataSource::IntProperty);
  count->setKey(0, 0, 7);
  count->setKey(10, 5, 7);
  EXPECT_EQ(count->getValue(9), 0) << "constant at first";
  count->setInterpType(1);
  EXPECT_EQ(count->getValue(5), 3) << "rounded";
  count->setInterpType(3);
  count->setInterpType(-1);
  EXPECT_EQ(count->getInterpolation(), Interpolation::Linear);
  auto* flag = channel<BoolController>("Flag", DataSource::BoolProperty);
  EXPECT_EQ(flag->getNumInterpTypes(), 1);
  flag->setInterpType(1);
  EXPECT_EQ(flag->getInterpolation(), Interpolation::Constant);
  EXPECT_STREQ(count->getInterpTypeName(2), "Cubic");
}

TEST_F(ControllerTest, ADiscardedEditNeverWas) {
  auto* place = m_node->getTranslationChannel();
  place->setKey(0, {1, 1, 1}, 7);
  m_node->getWSPos(0);
  m_node->beginDataEdit(HTimeRange::forever());
  m_node->beginDataEdit(HTimeRange::forever());
  place->setKey(0, {5, 5, 5}, 7);
  place->setKey(9, {5, 5, 5}, 7);
  place->setInterpType(2);
  place->setConstValue({4, 4, 4}, true, false);
  Controller* added = m_node->addChannel("Added", DataSource::FloatProperty);
  static_cast<FloatController*>(added)->setKey(0, 1, 7);
  EXPECT_EQ(m_node->getWSPos(0).x, 5);
  m_node->discardDataEdit();
  EXPECT_EQ(m_node->getWSPos(0).x, 1);
  EXPECT_EQ(place->getNumKeys(), 1);
  EXPECT_EQ(place->getInterpolation(), Interpolation::Linear);
  EXPECT_EQ(place->getConstValue(), Vec3());
  EXPECT_EQ(added->getNumKeys(), 0);
  place->setKey(3, {5, 5, 5}, 7);
  m_node->endDataEdit();
  m_node->endDataEdit();
  m_node->discardDataEdit();
  EXPECT_EQ(place->getNumKeys(), 2);
}

TEST_F(ControllerTest, CopiesOfChannels) {
  auto* source = m_node->getTranslationChannel();
  source->setKey(0, {1, 2, 3}, 7);
  source->setConstValue({4, 5, 6}, true, false);
  source->setInterpType(2);
  source->selectKeys(HTimeRange::forever(), 7);
  auto* target = create<Node>("target")->getTranslationChannel();
  target->setKey(50, {}, 7);
  EXPECT_TRUE(target->copyFrom(source, false, false));
  EXPECT_TRUE(target->getNumKeys() == 1 && target->hasKeyAt(50));
  EXPECT_TRUE(target->copyFrom(source, true, false));
  EXPECT_TRUE(target->getNumKeys() == 1 && target->hasKeyAt(0) && target->getNumSelectedKeys() == 0);
  EXPECT_EQ(target->getConstValue(), Vec3(4, 5, 6));
  EXPECT_EQ(target->getInterpolation(), Interpolation::Cubic);
  EXPECT_TRUE(target->copyFrom(source, true, true));
  EXPECT_EQ(target->getNumSelectedKeys(), 1);
  EXPECT_FALSE(target->copyFrom(m_node->getRotationChannel(), true, true));
}

TEST_F(ControllerTest, FillTypesSpeakForTheirTime) {
  auto* marker = create<Marker>("m");
  EXPECT_EQ(marker->getFillType(0), Marker::Recorded);
  marker->setFillType(0, Marker::Filled, true);
  marker->setFillType(20, Marker::Recorded, true);
  EXPECT_EQ(marker->getFillType(0), Marker::Filled);
  EXPECT_EQ(marker->getFillType(10), Marker::Recorded) << "no key there";
  g_db->setActiveLayer(m_clip->addLayer());
  marker->setFillType(0, Marker::EditedByHand, true);
  EXPECT_EQ(marker->getFillType(0), Marker::EditedByHand) << "layers of fill types do not add up";
  EXPECT_EQ(marker->getFillType(20), Marker::Recorded);
  g_db->setActiveClip(nullptr);
  EXPECT_EQ(marker->getFillType(0), Marker::Recorded);
}

}  // namespace
