// Random edits of markers and devices, of all kinds, saved as C3D after each: the file has the frames that a
// model has that knows nothing but frames.
#include <algorithm>
#include <array>
#include <filesystem>
#include <gtest/gtest.h>
#include <random>

#include "host/scene/Database.h"
#include "host/scene/HTimeManager.h"
#include "host/scene/Module.h"
#include "io/TakeFormats.h"
#include "session/Session.h"

namespace {

constexpr int kSavedFrames = 40, kAllFrames = 400;

// The components that have data, by frame.
using Data = std::array<unsigned, kAllFrames>;

struct Curve {
  std::string module, channel;
  bool vector;
};

std::vector<Curve> const kCurves = {{"\\S\\A", "Translation", true},
                                    {"\\S\\B", "Translation", true},
                                    {"\\h\\A", "Translation", true},
                                    {"\\D", "Force", true},
                                    {"\\D", "Emg", false}};
constexpr size_t kTargetOfCollapse = 0, kSourceOfCollapse = 2;

class SavedFrames : public testing::Test {
 protected:
  using Model = std::vector<Data>;

  SavedFrames() {
    m_session.setAssumeYes(true);
    m_session.setUndo(true);
  }
  ~SavedFrames() override {
    m_session.setUndo(false);
    g_db->newScene();
    std::filesystem::remove(m_file);
  }

  void run(std::string const& line) {
    talix::LineResult const& result = m_session.run(line);
    m_script += line + "\n";
    ASSERT_FALSE(result.failed()) << m_script << (result.log.empty() ? "" : result.log.back().text);
  }

  int upTo(int n) { return std::uniform_int_distribution<int>(0, n)(m_random); }
  int frame() { return 1 + upTo(kSavedFrames - 1); }
  size_t curve() { return static_cast<size_t>(upTo(static_cast<int>(kCurves.size()) - 1)); }

  static Controller* channelOf(Curve const& curve) {
    return g_db->getModuleWithPath(curve.module.c_str(), nullptr, false)->getChannel(curve.channel.c_str());
  }
  // The components that each key holds, and those that are selected.
  struct Keys {
    Data held{}, selected{};
  };
  static Keys keysOf(size_t curve) {
    Keys keys;
    KeyTrack const* track = channelOf(kCurves[curve])->findActiveTrack();
    int64 const period = HTimeManager::getInstance()->getTicksPerFrame();
    for (int64 i = 0; track && i < track->count(); ++i) {
      KeyTrack::Key const key = track->at(i);
      EXPECT_EQ(key.time % period, 0) << "a key between frames";
      keys.held[static_cast<size_t>(key.time / period)] = key.components;
      keys.selected[static_cast<size_t>(key.time / period)] = key.selected;
    }
    return keys;
  }
  void choose(size_t curve, std::string const& component = "") {
    run("select " + kCurves[curve].module);
    run("selectChannels " + kCurves[curve].channel + component);
  }

  // --- edits: each returns the model after it ---

  // A row of keys that bends now and then, so that some can be taken out.
  Model fill(Model model, size_t curve, int first, int last) {
    for (int f = first; f <= last; ++f) {
      std::string const x = std::to_string(f % 7 == 0 ? f + 30 : f);
      run("setKey " + kCurves[curve].channel + " " + (kCurves[curve].vector ? x + " 5 " + x : x) + " -t " +
          std::to_string(f) + " -onMod " + kCurves[curve].module);
      model[curve][static_cast<size_t>(f)] = 7;
    }
    return model;
  }

  Model thin(Model model, size_t curve) {
    choose(curve);
    selectTime();
    run(upTo(1) ? "reduceKeys -all" : "reduceKeys -ranges");
    return model;
  }

  Model cutRange(Model model, size_t curve) {
    bool const part = kCurves[curve].vector && upTo(3) == 0;
    choose(curve, part ? ".y" : "");
    auto const [first, last] = selectTime();
    int const keys = channelOf(kCurves[curve])->getNumKeys();
    run("cutKeys -ranges");
    for (int f = first; keys > 0 && f <= last; ++f) model[curve][static_cast<size_t>(f)] &= part ? 5u : 0u;
    return model;
  }

  Model cutSelected(Model model, size_t curve) {
    choose(curve);
    selectSomeKeys(curve);
    Keys const keys = keysOf(curve);
    run("cutKeys");
    for (unsigned c = 1; c < 8; c *= 2) forEachChosen(keys, c, [&](size_t f) { model[curve][f] &= ~c; });
    return model;
  }

  Model copyAndPaste(Model model, size_t from, size_t to) {
    if (kCurves[from].vector != kCurves[to].vector) return model;
    choose(from);
    selectSomeKeys(from);
    auto const [first, last] = selectTime();
    Keys keys = keysOf(from);
    int const way = upTo(2);
    run(way == 0 ? "copyKeys" : way == 1 ? "copyKeys -ranges" : "copyKeys -all");
    // Copied whole, a key holds the components that it lacks as well.
    for (int f = 0; way > 0 && f < kAllFrames; ++f) {
      auto& chosen = keys.selected[static_cast<size_t>(f)];
      auto& held = keys.held[static_cast<size_t>(f)];
      chosen = held && (way == 2 || (f >= first && f <= last)) ? 7 : 0;
      held = held ? 7 : 0;
    }
    auto const start = std::find_if(keys.selected.begin(), keys.selected.end(), [](unsigned c) { return c; });
    if (start == keys.selected.end()) return model;
    auto const origin = static_cast<size_t>(start - keys.selected.begin());
    auto const at = static_cast<size_t>(frame());
    choose(to);
    run("pasteKeys -useFrame " + std::to_string(at));
    Data const source = model[from];
    for (unsigned c = 1; c < 8; c *= 2)
      forEachChosen(keys, c, [&](size_t f) {
        if (f + at - origin < kAllFrames) model[to][f + at - origin] |= c & (source[f] | keys.selected[f]);
      });
    return model;
  }

  Model copyChannel(Model model, size_t from, size_t to) {
    if (kCurves[from].vector != kCurves[to].vector || from == to) return model;
    run("copyData " + kCurves[from].module + "." + kCurves[from].channel + " " + kCurves[to].module + "." +
        kCurves[to].channel);
    model[to] = model[from];
    return model;
  }

  Model collapse(Model model) {
    run("select \\h\\A \\S\\A");
    run("collapse");
    model[kTargetOfCollapse] = model[kSourceOfCollapse];
    return model;
  }

  std::pair<int, int> selectTime() {
    int const first = frame(), last = std::min(first + upTo(12), kSavedFrames);
    run("selectTime " + std::to_string(first) + " " + std::to_string(last));
    return {first, last};
  }

  void selectSomeKeys(size_t curve) {
    std::string const& channel = kCurves[curve].channel;
    run("selectKeys -none");
    for (int i = 0; i < 3; ++i) {
      int const first = frame(), last = first + upTo(6);
      run("selectKeys " + channel + (kCurves[curve].vector && upTo(4) == 0 ? ".x" : "") + " -add -frames " +
          std::to_string(first) + " " + std::to_string(last));
    }
  }

  // Each frame with a chosen key of a component, and between two neighbours that are both chosen.
  template <class Visit>
  static void forEachChosen(Keys const& keys, unsigned component, Visit visit) {
    int former = -1;
    for (int f = 0; f < kAllFrames; ++f) {
      auto const at = static_cast<size_t>(f);
      if (!(keys.held[at] & component)) continue;
      bool const chosen = (keys.selected[at] & component) != 0;
      for (int between = former + 1; chosen && former >= 0 && between < f; ++between)
        visit(static_cast<size_t>(between));
      if (chosen) visit(at);
      former = chosen ? f : -1;
    }
  }

  // --- comparing ---

  static std::string seen(KeyTrack const& track) {
    int64 const period = HTimeManager::getInstance()->getTicksPerFrame();
    std::string text;
    for (int64 f = 1; f <= kSavedFrames; ++f) text += track.find(f * period) >= 0 ? 'x' : '.';
    return text;
  }
  static std::string seen(Data const& data) {
    std::string text;
    for (size_t f = 1; f <= kSavedFrames; ++f) text += data[f] ? 'x' : '.';
    return text;
  }

  void compare(Model const& model) {
    run("save " + m_file);
    talix::Take const take = talix::readTake(m_file);
    ASSERT_EQ(take.points.size(), 3u);
    for (size_t i = 0; i < 3; ++i) ASSERT_EQ(seen(take.points[i].positions), seen(model[i])) << m_script;
    ASSERT_EQ(take.outputs.size(), 1u);
    ASSERT_EQ(seen(take.outputs[0].values), seen(model[3])) << m_script;
    // A file has a sample at every frame.
    KeyTrack const* samples = channelOf(kCurves[4])->findActiveTrack();
    int64 const period = HTimeManager::getInstance()->getTicksPerFrame();
    for (int64 f = 1; samples && f <= kSavedFrames; ++f)
      ASSERT_EQ(samples->find(f * period) >= 0 || samples->bridgedAt(f * period),
                model[4][static_cast<size_t>(f)] != 0)
          << f << "\n"
          << m_script;
  }

  talix::Session m_session{TALIX_BIN "/TalixDataCommands.so"};
  std::string m_file = testing::TempDir() + "saved_frames_" + std::to_string(std::random_device()()) + ".c3d";
  std::string m_script;
  std::mt19937 m_random;
};

TEST_F(SavedFrames, AreThoseOfTheModelAfterAnyEdits) {
  UndoJournal& journal = g_db->getUndoJournal();
  int changes = 0;
  for (unsigned seed = 1; seed <= 8; ++seed) {
    m_random.seed(seed);
    m_script.clear();
    for (char const* line :
         {"newScene", "create Clip c", "create Character S", "create Marker A -parent S",
          "create Marker B -parent S", "create Node h", "create Marker A -parent h", "create AnalogDevice D",
          "addChannel D Force vector", "addChannel D Emg float", "setAnimRange 1 40"})
      run(line);
    Model model(kCurves.size());
    for (size_t i = 0; i < kCurves.size(); ++i) model = fill(model, i, 1 + upTo(5), kSavedFrames - upTo(5));
    for (int step = 0; step < 40 && !HasFatalFailure(); ++step) {
      int const before = journal.getNumUndoSteps();
      Model const then = model;
      size_t const one = curve(), other = curve();
      int const kind = upTo(9);
      int const first = frame();
      model = kind <= 2   ? thin(model, one)
              : kind == 3 ? fill(model, one, first, std::min(first + upTo(4), kSavedFrames))
              : kind == 4 ? cutRange(model, one)
              : kind == 5 ? cutSelected(model, one)
              : kind <= 7 ? copyAndPaste(model, one, other)
              : kind == 8 ? copyChannel(model, one, other)
                          : collapse(model);
      compare(model);
      changes += model != then;
      if (HasFatalFailure() || upTo(2)) continue;
      int const steps = journal.getNumUndoSteps() - before;
      for (int i = 0; i < steps; ++i) run("undo");
      compare(then);
      if (upTo(1)) {
        for (int i = 0; i < steps; ++i) run("redo");
        compare(model);
      } else {
        model = then;
      }
    }
    ASSERT_FALSE(HasFatalFailure()) << "seed " << seed;
  }
  EXPECT_GT(changes, 80) << "edits did nothing";
}

}  // namespace
