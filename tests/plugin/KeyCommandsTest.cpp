// Key commands on scenes that scripts cannot make: random selections, the ends of time.
#include <random>
#include <set>

#include "host/scene/HTimeManager.h"
#include "host/scene/PropertyTable.h"
#include "tests/plugin/SceneFixture.h"

namespace {

class KeyCommands : public SceneFixture {
 protected:
  KeyCommands() { make<Clip>("take"); }

  static HTimeManager& manager() { return *HTimeManager::getInstance(); }
  static int64 at(int frame) { return manager().getTime(frame); }
  static int frame() { return manager().getFrame(manager().getTime()); }
  static void activate(std::initializer_list<char const*> names) {
    std::vector<unsigned> ids;
    for (char const* name : names) ids.push_back(Controller::mapPropertyName(name) | PropertyTable::kWhole);
    g_db->setActiveProperties(ids);
  }
  static void selectOnly(Module* module) {
    g_db->selectAllModules(false);
    module->setSelected(true);
  }
};

class Stepping : public KeyCommands {
 protected:
  static constexpr int kFrames = 30;

  // Keys at some frames of two channels of two nodes, some of them selected, some on one component only.
  void scatter() {
    activate({"Translation", "Scale"});
    for (Node* node : nodes) {
      node->setSelected(true);
      for (Controller* channel : {node->getProperty("Translation"), node->getProperty("Scale")}) {
        KeyTrack track(KeyTrack::Shape::Vector, {4, 4});
        for (int i = 0; i < kFrames; ++i)
          if (upTo(3)) {
            track.set(at(i), {}, 7);
            if (upTo(2)) track.setSelected(track.count() - 1, 1u << upTo(3));
          }
        channel->setTrack(g_db->getActiveClip(), 0, track);
      }
    }
    manager().setAnimRange(HTimeRange(at(upTo(8)), at(kFrames - 1 - upTo(8))), true);
  }

  // The frames at which runs of selected keys begin (end), looked for key by key.
  std::set<int> runEnds(bool back) {
    std::set<int> frames;
    for (Node* node : nodes)
      for (Controller* channel : {node->getProperty("Translation"), node->getProperty("Scale")}) {
        bool inRun = false;
        for (int i = 0; i < kFrames; ++i) {
          int const n = back ? kFrames - 1 - i : i;
          if (!manager().getAnimRange().contains(at(n)) || !channel->hasKeyAt(at(n))) continue;
          bool const selected = channel->isKeySelectedAt(at(n), 7);
          if (selected && !inRun) frames.insert(n);
          inRun = selected;
        }
      }
    return frames;
  }

  // The frame that a step leads to.
  int step(bool back) {
    std::string const said = back ? run("findSelectedKeys", {}, {{"b"}}) : run("findSelectedKeys");
    EXPECT_EQ(said, "info: Found one or more selected keys\nnothing");
    return frame();
  }

  int upTo(int n) { return static_cast<int>(random() % static_cast<unsigned>(n)); }

  std::mt19937 random{1};
  Node* nodes[2] = {make("a"), make("b")};
};

TEST_F(Stepping, ComesToEveryRunOnceInARound) {
  for (int trial = 0; trial < 300; ++trial) {
    scatter();
    for (bool back : {false, true}) {
      std::set<int> const ends = runEnds(back);
      std::vector<int> round(ends.begin(), ends.end());
      if (round.empty()) continue;
      if (back) std::reverse(round.begin(), round.end());
      manager().setTime(at(upTo(kFrames)), true);
      // Wherever it starts, from then on it goes around.
      int const start = step(back);
      auto next = std::find(round.begin(), round.end(), start);
      ASSERT_NE(next, round.end()) << "frame " << start << " begins no run";
      for (size_t i = 0; i < 2 * round.size(); ++i) {
        if (++next == round.end()) next = round.begin();
        ASSERT_EQ(step(back), *next) << "trial " << trial << (back ? " back" : "");
      }
    }
  }
}

TEST_F(Stepping, StartsBehindTheCurrentTime) {
  for (int trial = 0; trial < 300; ++trial) {
    scatter();
    for (bool back : {false, true}) {
      std::set<int> const ends = runEnds(back);
      int const from = upTo(kFrames);
      manager().setTime(at(from), true);
      auto const next = back ? ends.lower_bound(from) : ends.upper_bound(from);
      bool const opens = back ? next == ends.end() : next == ends.begin();
      bool const wraps = back ? next == ends.begin() : next == ends.end();
      if (ends.empty()) {
        EXPECT_EQ(run("findSelectedKeys"), "info: No selected keys found\nnothing");
        EXPECT_EQ(frame(), from);
      } else if (wraps) {
        ASSERT_EQ(step(back), back ? *ends.rbegin() : *ends.begin());
      } else if (!opens) {
        ASSERT_EQ(step(back), back ? *std::prev(next) : *next);
      }
    }
  }
}

TEST_F(KeyCommands, RefuseTimesBeyondTheTimeLine) {
  Node* node = make("n");
  activate({"Translation"});
  selectOnly(node);
  for (int i : {0, 5}) node->getTranslationChannel()->setKey(at(i), {}, 7);
  run("copyKeys", {}, {{"all"}});
  manager().setTime(kForever - at(4), true);
  EXPECT_EQ(run("pasteKeys"), "error: The pasted keys would lie beyond the time line.\nfailed");
  EXPECT_EQ(run("getKeys", {"Translation"}), "[0 5]");
  manager().setTime(kForever - at(5), true);
  EXPECT_EQ(run("pasteKeys"), "info: Pasted 1 keys from the clipboard\nnothing");

  HFrameRate slow;
  slow.setFrameRate(1e-3);
  manager().setFrameRate(slow);
  constexpr int kFar = 2147483647;  // 68,000 years at this rate
  std::string const beyond = "error: Frame 2147483647 lies beyond the time line.\nfailed";
  EXPECT_EQ(run("hasKey", {"n", "Translation"}, {{"frame", {kFar}}}), beyond);
  EXPECT_EQ(run("hasKey", {"n", "Translation"}, {{"seconds", {kFar}}}), beyond);
  EXPECT_EQ(run("pasteKeys", {}, {{"useFrame", {kFar}}}), beyond);
  EXPECT_EQ(run("setKey", {"tx", 1}, {{"t", {kFar}}, {"onMod", {"n"}}}), beyond);
  EXPECT_EQ(run("hasKey", {"n", "Translation"}, {{"frame", {-2000000}}}), "false");
}

}  // namespace
