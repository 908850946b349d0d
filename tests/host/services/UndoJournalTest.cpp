// Undo and redo bring the whole scene back, whatever was done.
#include <map>
#include <set>
#include <sstream>

#include "host/scene/Bones.h"
#include "host/scene/ChangeSetBuilder.h"
#include "host/scene/ClipboardManager.h"
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
  // What a step also moves is brought back when it is discarded.
  template <class Edit>
  void discarded(Edit edit) {
    HTimeManager& time = *g_db->getTimeManager();
    int64 const now = time.getTime();
    Module* priority = g_db->getPriorityModule();
    int const keys = g_db->getClipboardManager()->getNumControllerKeys();
    journal().beginStep();
    edit();
    time.setTime(anyTime(), true);
    g_db->setPrioritySearchModule(anyModule());
    ClipboardManager& clipboard = *g_db->getClipboardManager();
    clipboard.startClipboardCopy(ClipboardManager::ControllerData, ClipboardManager::FloatKeys);
    clipboard.addKey({});
    clipboard.finishClipboardCopy(true);
    ASSERT_TRUE(journal().discardStep());
    EXPECT_EQ(time.getTime(), now);
    EXPECT_EQ(g_db->getPriorityModule(), priority);
    EXPECT_EQ(clipboard.getNumControllerKeys(), keys);
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
    int const count = g_db->getNumModules();
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
    HTimeRange const range(anyTime(), anyTime());
    auto const mask = static_cast<unsigned>(1 + below(7));
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
    auto const editAnyChannel = [&] {
      if (auto const count = static_cast<size_t>(module.getNumChannels()))
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
        if (below(4) == 0) g_db->removeFromScene(g_db->getActiveClip(), true, true, true, true);
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
          int const layer = below(2) ? clip->addLayer()
                                     : static_cast<int>(below(static_cast<size_t>(clip->getNumLayers())));
          g_db->setActiveLayer(layer);
          clip->setLayerLocked(layer, below(4) == 0);
        }
        return;
      case 8:
        g_db->getTimeManager()->setPlayRange(HTimeRange(0, anyTime()), true);
        g_db->setActiveProperties({0x70000001u, static_cast<unsigned>(below(4))});
        return;
      default:
        if (Module* module = anyModule()) editModule(*module);
    }
  }
};

// What a change set tells, found by going through the whole scene.
class NaiveState {
 public:
  NaiveState() {
    put("", "ActiveClip", name(g_db->getActiveClip()));
    put("", "ActiveLayer", std::to_string(g_db->getActiveLayer()));
    put("", "UpAxis", std::to_string(g_db->getUpAxis()));
    HTimeRange const range = g_db->getTimeManager()->getPlayRange();
    put("", "PlayRange", std::to_string(range.getStart()) + " " + std::to_string(range.getEnd()));
    for (int i = 0; i < g_db->getNumActiveProperties(); ++i) {
      m_texts["0 attribute ActiveProperties"] +=
          Controller::mapPropertyId(g_db->getActiveProperty(i)).GetString() +
          std::to_string(g_db->getActiveProperty(i) >> 28 & 7) + " ";
    }
    m_texts["0 selection Primary"] = name(g_db->getPrimarySelectedModule());
    for (int i = 0; i < g_db->getNumModules(); ++i) add(*g_db->getModule(i));
  }

  // Lines as linesOf() a change set gives them.
  static std::set<std::string> difference(NaiveState const& before, NaiveState const& after) {
    std::set<std::string> lines;
    for (auto const& [id, state] : before.m_modules)
      if (!after.m_modules.contains(id)) lines.insert(id + " removed " + state);
    for (auto const& [id, state] : after.m_modules)
      if (!before.m_modules.contains(id)) lines.insert(id + " created " + state);
    auto const stays = [&](std::string const& key) {
      std::string const id = key.substr(0, key.find(' '));
      return id == "0" || (before.m_modules.contains(id) && after.m_modules.contains(id));
    };
    std::map<std::string, std::pair<std::string, std::string>> texts;
    for (auto const& [key, text] : before.m_texts) texts[key].first = text;
    for (auto const& [key, text] : after.m_texts) texts[key].second = text;
    for (auto const& [key, text] : texts)
      if (stays(key) && text.first != text.second && !isOfNewChannel(before, key)) lines.insert(key);
    std::map<std::string, std::pair<Keys, Keys>> keys;
    for (auto const& [key, track] : before.m_keys) keys[key].first = track;
    for (auto const& [key, track] : after.m_keys) keys[key].second = track;
    for (auto const& [key, both] : keys)
      if (stays(key) && both.first != both.second) lines.insert(key + keyDifference(both.first, both.second));
    return lines;
  }
  static std::set<std::string> linesOf(ChangeSet const& changes) {
    static constexpr char const* kinds[] = {"keys",   "created",   "removed", "renamed",
                                            "parent", "attribute", "default", "selection"};
    std::set<std::string> lines;
    for (SceneChange const& change : changes) {
      std::string const id = std::to_string(change.id.getNumber());
      std::string line = id + " " + kinds[static_cast<int>(change.kind)] + " ";
      bool const whole =
          change.kind == SceneChange::Kind::removed || change.kind == SceneChange::Kind::created;
      line += whole && change.name.IsEmpty() ? change.path.GetString() : change.name.GetString();
      if (change.kind == SceneChange::Kind::keys)
        line += " " + std::to_string(change.clip.getNumber()) + " " + std::to_string(change.layer) +
                numbers(change.added, change.removed, change.changed, change.range.getStart(),
                        change.range.getEnd(), change.largest);
      EXPECT_TRUE(lines.insert(line).second) << line << " is told twice";
    }
    return lines;
  }

 private:
  using Keys = std::map<int64, std::vector<double>>;  // by time: flags, then values

  // Of a channel that was added nothing but that, and its keys, is told.
  static bool isOfNewChannel(NaiveState const& before, std::string const& key) {
    std::istringstream words(key);
    std::string id, kind, what;
    words >> id >> kind >> what;
    size_t const dot = what.find('.');
    return (kind == "default" || dot != what.npos) &&
           !before.m_texts.contains(id + " created " + what.substr(0, dot));
  }

  static std::string name(Module const* module) {
    return module ? std::to_string(module->getID().getNumber()) : "";
  }
  static std::string numbers(int64 added, int64 removed, int64 changed, int64 first, int64 last,
                             double largest) {
    std::ostringstream text;
    text << ": +" << added << " -" << removed << " ~" << changed << " from " << first << " to " << last
         << " by " << largest;
    return text.str();
  }
  static std::string keyDifference(Keys const& before, Keys const& after) {
    int64 added = 0, removed = 0, changed = 0;
    double largest = 0;
    std::set<int64> times;
    for (auto const& [time, key] : before)
      if (!after.contains(time)) times.insert(time), ++removed;
    for (auto const& [time, key] : after) {
      auto const known = before.find(time);
      if (known != before.end() && known->second == key) continue;
      times.insert(time);
      if (known == before.end()) {
        ++added;
        continue;
      }
      ++changed;
      std::vector<double> const& former = known->second;
      if (key.size() == 7) {
        double dot = 0;
        for (size_t i = 3; i < 7; ++i) dot += former[i] * key[i];
        largest = std::max(largest, 2 * std::acos(std::min(1.0, std::abs(dot))));
      } else {
        unsigned const both = static_cast<unsigned>(former[0]) & static_cast<unsigned>(key[0]);
        for (size_t i = 3; i < key.size(); ++i)
          if (both >> (i - 3) & 1) largest = std::max(largest, std::abs(key[i] - former[i]));
      }
    }
    return numbers(added, removed, changed, *times.begin(), *times.rbegin(), largest);
  }

  void put(std::string const& id, std::string const& what, std::string const& text) {
    m_texts[(id.empty() ? "0" : id) + " attribute " + what] = text;
  }
  void add(Module const& module) {
    std::string const id = name(&module);
    m_modules[id] = module.getFullPathString().GetString();
    m_texts[id + " renamed "] = module.getName().GetString();
    m_texts[id + " parent "] = name(module.getParent());
    m_texts[id + " selection "] = module.isSelected() ? "true" : "false";
    for (int i = 0; i < module.getNumAttributes(); ++i) {
      Attribute const& attribute = *module.getAttribute(i);
      std::string text = attribute.isSet() ? "set " : "";
      if (auto* one = std::get_if<Module*>(&attribute.getRawValue()))
        text += name(*one);
      else if (auto* several = std::get_if<Attribute::Modules>(&attribute.getRawValue()))
        for (Module const* each : *several) text += name(each) + " ";
      else
        text += textOf(attribute.getRawValue());
      put(id, attribute.getName().GetString(), text + "!");
    }
    for (int i = 0; i < module.getNumChannels(); ++i) add(id, *module.getChannel(i));
    if (auto const* clip = objectAs<NLEClip>(&module))
      for (int layer = 0; layer < clip->getNumLayers(); ++layer)
        m_texts[id + " attribute LayerLocks"] += clip->isLayerLocked(layer) ? "1" : "0";
    if (auto const* node = objectAs<Node>(&module)) {
      put(id, "PreTranslation", textOf(node->getPreTranslation()));
      put(id, "PreRotation", textOf(node->getPreRotation()));
      for (int i = 0; i < node->getNumConnectingLines(); ++i)
        m_texts[id + " attribute ConnectingLines"] += name(node->getConnectingLine(i).getTarget()) +
                                                      textOf(node->getConnectingLine(i).getConnectingColor());
    }
  }
  void add(std::string const& id, Controller const& channel) {
    std::string const own = channel.getName().GetString();
    m_texts[id + " created " + own] = "there";
    put(id, own + ".Interpolation", std::to_string(static_cast<int>(channel.getInterpolation())));
    put(id, own + ".Locked", channel.isLocked() ? "true" : "false");
    m_texts[id + " default " + own] = textOfList(channel.getDefaultValues());
    channel.forEachTrack([&](NLEClip* clip, int layer, KeyTrack const& track) {
      // Each clip is compared with those in the scene: one that is gone may not even be looked at.
      NLEClip const* known = g_db->getHeadClip();
      while (known && known != clip) known = known->getNext();
      ASSERT_TRUE(known) << own << " has a track for a clip that has left the scene";
      Keys& keys = m_keys[id + " keys " + own + " " + name(clip) + " " + std::to_string(layer)];
      track.forEach(0, track.count(), [&](KeyTrack::Key const& key) {
        std::vector<double>& values = keys[key.time];
        values = {double(key.components), double(key.selected), double(key.bridges)};
        values.insert(values.end(), key.values.begin(), key.values.begin() + track.width());
      });
    });
  }

  std::map<std::string, std::string> m_modules;  // paths
  std::map<std::string, std::string> m_texts;
  std::map<std::string, Keys> m_keys;
};

TEST_F(UndoTest, RandomEditsComeAndGo) {
  for (unsigned seed = 1; seed <= 30; ++seed) {
    journal().clear();
    g_db->newScene();
    m_random.seed(seed);
    std::vector<std::string> states{SceneText().write()};
    int position = 0;
    for (int round = 0; round < 250; ++round) {
      std::string const when = "seed " + std::to_string(seed) + ", round " + std::to_string(round);
      if (below(6) == 0) {
        for (size_t n = below(12); n > 0 && undo(); --n) --position;
        for (size_t n = below(12); n > 0 && redo(); --n) ++position;
        expectScene(states[static_cast<size_t>(position)], when);
      }
      NaiveState const before;
      auto const edit = [this] {
        for (size_t n = 1 + below(4); n > 0; --n) editScene();
      };
      if (below(8) == 0) {
        discarded(edit);
        expectScene(states[static_cast<size_t>(position)], "discarded, " + when);
        continue;
      }
      step([&] {
        edit();
        auto const expected = NaiveState::difference(before, NaiveState());
        ASSERT_EQ(NaiveState::linesOf(journal().getChanges()), expected) << when;
      });
      std::string const after = SceneText().write();
      std::string const difference = firstDifference(states[static_cast<size_t>(position)], after);
      if (journal().getNumUndoSteps() == position) {
        ASSERT_EQ(difference, "") << "no step was left, " << when;
        continue;
      }
      states.resize(static_cast<size_t>(++position));
      states.push_back(after);
      ASSERT_EQ(journal().getNumUndoSteps(), position) << when;
      ASSERT_EQ(NaiveState::linesOf(journal().getChanges()), NaiveState::difference(before, NaiveState()))
          << when;
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
  auto const setKey = [&](int64 frame) {
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
  EXPECT_LE(journal().getMemoryUse(), 60);
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
  auto const rename = [&](int i) { node->setName(HString("name" + std::to_string(i))); };
  step([&] { rename(100); });
  int64 const one = journal().getMemoryUse();
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
