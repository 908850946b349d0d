// Undo and redo bring the whole scene back, whatever was done.
#include "host/scene/Bones.h"
#include "host/scene/Constraints.h"
#include "host/scene/Setups.h"
#include "host/scene/UndoJournal.h"
#include "tests/SceneText.h"
#include "tests/host/scene/SceneFixture.h"

namespace {

using talix_tests::firstDifference;
using talix_tests::SceneText;

class UndoTest : public SceneTest {
 protected:
  UndoTest() { journal().setEnabled(true); }
  ~UndoTest() override { journal().setEnabled(false); }

  static UndoJournal& journal() { return g_db->getUndoJournal(); }
  template <class Edit>
  static void step(Edit edit) {
    journal().beginStep();
    edit();
    journal().endStep("edit");
  }
  static bool undo() {
    HString name;
    return journal().undo(name);
  }
  static bool redo() {
    HString name;
    return journal().redo(name);
  }
  static void expectScene(std::string const& text, std::string const& when) {
    ASSERT_EQ(firstDifference(text, SceneText().write()), "") << when;
  }

  Module* anyModule() {
    const int count = g_db->getNumModules();
    return count ? g_db->getModule(static_cast<int>(below(static_cast<size_t>(count)))) : nullptr;
  }
  template <class T>
  T* any() {
    for (int tries = 0; tries < 8; ++tries)
      if (auto* found = objectAs<T>(anyModule())) return found;
    return nullptr;
  }
  HString anyName() { return HString(std::string(1, static_cast<char>('a' + below(6)))); }
  int64 anyTime() { return static_cast<int64>(below(200)) * kFrame; }

  void createOne() {
    static HRuntimeClass* const types[] = {&Node::s_classNode,
                                           &Marker::s_classMarker,
                                           &Character::s_classCharacter,
                                           &Clip::s_classClip,
                                           &SolvingBone::s_classSolvingBone,
                                           &LabelingSetup::s_classLabelingSetup,
                                           &BlendClip::s_classBlendClip,
                                           &LabelingConstraint::s_classLabelingConstraint};
    g_db->createModule(types[below(std::size(types))], anyName().GetStr(), below(2) ? anyModule() : nullptr);
  }

  void editKeys(Controller& channel) {
    if (!channel.isEditable()) return;
    const HTimeRange range(anyTime(), anyTime());
    const auto mask = static_cast<unsigned>(1 + below(7));
    channel.beginDataEdit(range);
    switch (below(7)) {
      case 6: {
        KeyTrack track(Controller::shapeOf(channel.getPropertyType()));
        for (size_t n = below(80); n-- > 0;) track.set(anyTime(), {uniform(-9, 9), 1, 2, 3});
        channel.setTrack(g_db->getActiveClip(), g_db->getActiveLayer(), std::move(track));
        break;
      }
      case 0:
        channel.deleteKeys(range, mask, below(2) == 0);
        break;
      case 1:
        channel.selectKeys(range, mask);
        break;
      case 2:
        channel.deselectKeys(range, mask);
        break;
      case 3:
        channel.deleteSelectedKeys(mask);
        break;
      default:
        // From a single key to more than are recorded one by one.
        for (size_t n = below(2) ? 1 : below(150); n-- > 0;) {
          Controller::Values values{uniform(-9, 9), uniform(-9, 9), uniform(-9, 9), 1};
          channel.writeKeyAt(anyTime(), values, mask);
        }
    }
    channel.endDataEdit();
  }

  void editModule(Module& module) {
    const auto editAnyChannel = [&] {
      if (const auto count = static_cast<size_t>(module.getNumChannels()))
        editKeys(*module.getChannel(static_cast<int>(below(count))));
    };
    switch (below(12)) {
      case 0:
        module.setName(anyName());
        break;
      case 1:
        if (Module* child = anyModule()) module.addChild(child);
        break;
      case 2:
        if (Module* parent = module.getParent()) parent->removeChild(&module, true);
        break;
      case 3:
        module.addChannel(anyName(), static_cast<DataSource::PropertyType>(1 + below(5)));
        break;
      case 4:
        module.addCustomAttribute(
            Attribute::create(static_cast<Attribute::Type>(below(2) ? 12 : 2), anyName()));
        break;
      case 5:
        for (int i = 0; i < module.getNumAttributes(); ++i) {
          if (auto* reference = objectAs<ModAttribute>(module.getAttribute(i)))
            reference->setValue(anyModule(), true, true, true, true);
          else if (auto* number = objectAs<FloatAttribute>(module.getAttribute(i)))
            number->setValue(uniform(-5, 5), true, true, true, true);
        }
        break;
      case 6:
        module.setVisible(below(2) == 0, true);
        break;
      case 7:
        if (module.getNumChannels()) {
          Controller& channel =
              *module.getChannel(static_cast<int>(below(static_cast<size_t>(module.getNumChannels()))));
          channel.setInterpType(static_cast<int>(below(3)));
          channel.setDefaultValues({uniform(-5, 5), 2, 3, 0});
          if (below(4) == 0) channel.setLocked(!channel.isLocked());
        }
        break;
      case 8:
        if (auto* node = objectAs<Node>(&module)) {
          node->setPreTranslation(randomVec(100));
          node->setPreRotation(randomRotation(), below(2) == 0);
          if (Node* target = any<Node>()) node->addConnectingLine(MarkerConnection(target));
        }
        break;
      case 9:
        editAnyChannel();
        module.beginDataEdit(HTimeRange(0, 1));
        editAnyChannel();
        module.discardDataEdit();
        editAnyChannel();
        break;
      default:
        editAnyChannel();
    }
  }

  void editScene() {
    switch (below(12)) {
      case 0:
      case 1:
        return createOne();
      case 2:
        if (g_db->getNumModules() > 12 || below(3) == 0)
          g_db->removeFromScene(anyModule(), true, true, true, true);
        return;
      case 3:
        g_db->selectAllModules(below(2) == 0);
        return;
      case 4:
        if (Module* module = anyModule()) module->setSelected(below(3) > 0);
        return;
      case 5:
        g_db->setPrimarySelectedModule(below(3) ? anyModule() : nullptr);
        return;
      case 6:
        g_db->setActiveClip(any<NLEClip>());
        return;
      case 7:
        if (NLEClip* clip = g_db->getActiveClip()) {
          const int layer = below(2) ? clip->addLayer()
                                     : static_cast<int>(below(static_cast<size_t>(clip->getNumLayers())));
          g_db->setActiveLayer(layer);
          clip->setLayerLocked(layer, below(4) == 0);
        }
        return;
      case 8:
        g_db->setActiveProperties({0x70000001u, static_cast<unsigned>(below(4))});
        return;
      default:
        if (Module* module = anyModule()) editModule(*module);
    }
  }
};

TEST_F(UndoTest, RandomEditsComeAndGo) {
  for (unsigned seed = 1; seed <= 30; ++seed) {
    journal().clear();
    g_db->newScene();
    m_random.seed(seed);
    std::vector<std::string> states{SceneText().write()};
    int position = 0;
    for (int round = 0; round < 250; ++round) {
      const std::string when = "seed " + std::to_string(seed) + ", round " + std::to_string(round);
      if (below(6) == 0) {
        for (size_t n = below(12); n > 0 && undo(); --n) --position;
        for (size_t n = below(12); n > 0 && redo(); --n) ++position;
        expectScene(states[static_cast<size_t>(position)], when);
      }
      step([this] {
        for (size_t n = 1 + below(4); n > 0; --n) editScene();
      });
      const std::string after = SceneText().write();
      const std::string difference = firstDifference(states[static_cast<size_t>(position)], after);
      if (journal().getNumUndoSteps() == position) {
        ASSERT_EQ(difference, "") << "no step was left, " << when;
        continue;
      }
      states.resize(static_cast<size_t>(++position));
      states.push_back(after);
      ASSERT_EQ(journal().getNumUndoSteps(), position) << when;
    }
    while (undo()) expectScene(states[static_cast<size_t>(--position)], "undo, seed " + std::to_string(seed));
    ASSERT_EQ(position, 0);
    while (redo()) expectScene(states[static_cast<size_t>(++position)], "redo, seed " + std::to_string(seed));
    ASSERT_EQ(position + 1, static_cast<int>(states.size()));
  }
}

TEST_F(UndoTest, AStepOfOneKeyIsSmallAndAMillionKeysAreSwapped) {
  create<Clip>("clip");
  auto* marker = create<Marker>("marker");
  Vec3Controller& channel = *marker->getTranslationChannel();
  const auto setKey = [&](int64 frame) {
    channel.beginDataEdit(HTimeRange(frame, frame));
    channel.setKey(frame * kFrame, {1, 2, static_cast<double>(frame)}, KeyTrack::kAll);
    channel.endDataEdit();
  };
  std::vector<double> values(3'000'000);
  for (size_t i = 0; i < values.size(); ++i) values[i] = std::sin(static_cast<double>(i));
  KeyTrack million(KeyTrack::Shape::Vector);
  million.append(0, kFrame, values.data(), 1'000'000);
  channel.setTrack(g_db->getActiveClip(), 0, million);

  step([&] { setKey(500'000); });
  EXPECT_LT(journal().getMemoryUse(), 400);
  step([&] { channel.deleteKeys(HTimeRange(0, 900'000 * kFrame), KeyTrack::kAll, false); });
  EXPECT_EQ(channel.getNumKeys(), 99'999);
  ASSERT_TRUE(undo());
  ASSERT_TRUE(undo());
  EXPECT_TRUE(*channel.findActiveTrack() == million);
  ASSERT_TRUE(redo());
  EXPECT_EQ(channel.getKeyValue(500'000), Vec3(1, 2, 500'000));
  ASSERT_TRUE(redo());
  EXPECT_EQ(channel.getNumKeys(), 99'999);
}

TEST_F(UndoTest, TheOldestStepsMakeRoom) {
  auto* node = create<Node>("node");
  const auto rename = [&](int i) { node->setName(HString("name" + std::to_string(i))); };
  step([&] { rename(100); });
  const int64 one = journal().getMemoryUse();
  journal().setMemoryLimit(one * 10);
  for (int i = 101; i < 200; ++i) step([&] { rename(i); });
  EXPECT_LE(journal().getMemoryUse(), one * 10);
  EXPECT_EQ(journal().getNumUndoSteps(), 10);
  while (undo()) continue;
  EXPECT_EQ(node->getName(), "name189");
  journal().setMemoryLimit(one / 2);
  step([&] { rename(200); });
  EXPECT_EQ(journal().getNumUndoSteps() + journal().getNumRedoSteps(), 0);
  EXPECT_EQ(journal().getMemoryUse(), 0);
  journal().setMemoryLimit(int64{1} << 30);
}

}  // namespace
