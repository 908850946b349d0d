// Several scenes in one process: each does what it would do alone, and belongs to one thread at a time.
#include <boost/json/object.hpp>
#include <functional>
#include <future>
#include <gtest/gtest.h>
#include <random>
#include <thread>

#include "host/scene/SceneScope.h"
#include "session/JsonForms.h"
#include "session/JsonText.h"
#include "session/Session.h"
#include "tests/SceneText.h"

namespace {

using talix_tests::firstDifference;

// A scene and all that its lines said.
class Stage {
 public:
  void run(std::string const& line) {
    talix::LineResult const& result = m_session.run(line);
    m_done += !result.failed();
    m_said += talix::jsonText(talix::toJson(result)) + "\n";
  }
  int done() const { return m_done; }
  std::string text() {
    SceneScope const scope(m_scene);
    return m_said + talix_tests::SceneText(m_scene).write();
  }
  Database& scene() { return m_scene; }

 private:
  Database m_scene;
  talix::Session m_session{TALIX_BIN "/TalixDataCommands.so", m_scene};
  std::string m_said;
  int m_done = 0;
};

// Lines that touch every kind of state that belongs to a scene, with names that scenes share and each uses in
// its own way: "heat" is of one kind or another.
std::vector<std::string> randomLines(unsigned seed, int count) {
  std::mt19937 random(seed);
  auto const below = [&](unsigned end) { return random() % end; };
  auto const oneOf = [&](std::initializer_list<char const*> texts) {
    return std::string(texts.begin()[below(static_cast<unsigned>(texts.size()))]);
  };
  auto const number = [&] { return std::to_string(below(60)); };
  auto const name = [&] { return oneOf({"\\a", "\\b", "\\hub", "a", "b", "hub"}); };
  auto const channel = [&] { return oneOf({"Translation", "tx", "Rotation", "heat", "HEAT"}); };
  std::string const heat = seed % 2 ? " heat float" : " heat vector", others = seed % 2 ? "" : " 1 2";
  std::function<std::string()> const makers[] = {
      [&] {
        return "create " + oneOf({"Node", "Marker", "Clip"}) + " " + oneOf({"a", "b", "hub"});
      },
      [&] { return "create OpticalCamera eye"; },
      [&] { return "create Character group"; },
      [&] { return "select " + name(); },
      [&] {
        return "select \\a \\b -primary " + oneOf({"\\a", "\\b"});
      },
      [&] { return "duplicate"; },
      [&] { return "parent -adjust"; },
      [&] { return "unparent"; },
      [&] { return "addChannel " + name() + heat; },
      [&] { return "setKey Translation " + number() + " 1 2 -t " + number() + " -onMod " + name(); },
      [&] { return "setKey heat " + number() + others + " -t " + number() + " -onMod " + name(); },
      [&] { return "selectChannels " + channel(); },
      [&] { return "selectKeys " + channel() + " -all -onMod " + name(); },
      [&] { return "copyKeys"; },
      [&] { return "pasteKeys"; },
      [&] { return "setTime " + number(); },
      [&] { return "getTime"; },
      [&] { return "getPosition " + name() + " -ws"; },
      [&] { return "setPosition " + name() + " <" + number() + " 1 1>"; },
      [&] { return "setPlayRange 0 " + number(); },
      [&] { return "addLayer"; },
      [&] { return "setActiveLayer " + std::to_string(below(2)); },
      [&] { return "setActiveClip take"; },
      [&] { return "setPriority"; },
      [&] { return "getModules"; },
      [&] { return "addAttribute " + name() + " note string x"; },
      [&] { return "setProperty Color 1 2 " + number(); },
      [&] { return "addNamespace stage"; },
      [&] { return "open \"" TALIX_TEST_DATA "/two_frames_01.bvh\""; },
      [&] { return "undo"; },
      [&] { return "undo 3"; },
      [&] { return "redo"; },
      [&] { return "delete"; }};
  std::vector<std::string> lines{"newScene",      "create Clip take", "create Marker a",
                                 "create Node b", "create Node hub",  "addChannel \\a" + heat,
                                 "select \\a"};
  auto const deletion = static_cast<unsigned>(std::size(makers)) - 1;
  // Seldom a deletion, so that there is something to work on.
  while (static_cast<int>(lines.size()) < count) lines.push_back(makers[below(deletion + below(2))]());
  return lines;
}

void prepare(Stage& stage) {
  SceneScope const scope(stage.scene());
  stage.scene().getUndoJournal().setEnabled(true);
}

std::string alone(std::vector<std::string> const& lines) {
  Stage stage;
  prepare(stage);
  for (std::string const& line : lines) stage.run(line);
  return stage.text();
}

TEST(Scenes, InTurnDoWhatTheyDoAlone) {
  std::string const bystander = talix_tests::SceneText(*g_db).write();
  int done = 0;
  for (unsigned seed = 1; seed < 40; seed += 2) {
    std::vector<std::string> a = randomLines(seed, 150), b = randomLines(seed + 1, 150);
    // Each is undone separately: this one now, the other one not.
    a.push_back("undo 20");
    b.push_back("setTime 7");
    Stage first, second;
    prepare(first);
    prepare(second);
    for (size_t i = 0; i < a.size(); ++i) first.run(a[i]), second.run(b[i]);
    ASSERT_EQ(firstDifference(alone(a), first.text()), "") << "seed " << seed;
    ASSERT_EQ(firstDifference(alone(b), second.text()), "") << "seed " << seed;
    done += first.done() + second.done();
  }
  EXPECT_EQ(firstDifference(bystander, talix_tests::SceneText(*g_db).write()), "")
      << "the current scene is none of them";
  EXPECT_GT(done, 40 * 75) << "half of the lines at least are not refused";
}

TEST(Scenes, AtOnceDoWhatTheyDoAlone) {
  auto const run = [](unsigned seed) { return alone(randomLines(seed, 800)); };
  std::vector<std::future<std::string>> atOnce;
  for (unsigned seed = 1; seed <= 4; ++seed) atOnce.push_back(std::async(std::launch::async, run, seed));
  for (unsigned seed = 1; seed <= 4; ++seed)
    EXPECT_EQ(firstDifference(run(seed), atOnce[seed - 1].get()), "") << "seed " << seed;
}

// What is thrown when another thread does this.
template <class Work>
std::string refusal(Work work) {
  return std::async(std::launch::async,
                    [&]() -> std::string {
                      try {
                        work();
                      } catch (std::exception const& error) {
                        return error.what();
                      }
                      return "";
                    })
      .get();
}

TEST(Scenes, BelongToOneThreadAtATime) {
  Database* const mine = g_db;
  Database inner;
  {
    SceneScope const once(inner);
    SceneScope const again(inner);
    EXPECT_EQ(g_db, &inner);
    auto* node = static_cast<Node*>(inner.createModule(&Node::staticClass(), "n", nullptr));
    EXPECT_EQ(node->getDatabase(), &inner);
    EXPECT_EQ(refusal([&] { SceneScope const scope(inner); }), "the scene is in use by another thread");
    EXPECT_EQ(refusal([&] { talix::Session("", inner); }), "the scene is in use by another thread");
    EXPECT_EQ(refusal([&] { node->setName("x"); }), "the scene is in use by another thread");
    EXPECT_EQ(refusal([&] { node->getWSPos(0); }), "the scene is in use by another thread");
    EXPECT_EQ(refusal([&] { HTimeManager::getInstance(); }), "this thread has no scene");
  }
  EXPECT_EQ(g_db, mine);
  EXPECT_EQ(refusal([&] { SceneScope const scope(*mine); }), "the scene is in use by another thread");
  EXPECT_EQ(refusal([&] { inner.getModule(0)->setName("x"); }), "the thread does not hold the scene");
  EXPECT_EQ(refusal([&] {
              SceneScope const scope(inner);
              inner.getModule(0)->setName("y");
            }),
            "");
  EXPECT_EQ(inner.getModule(0)->getName(), "y");
}

TEST(Scenes, TakeNoModuleOfAnother) {
  Database other;
  SceneScope const outer(other);
  Module* strange = other.createModule(&Marker::staticClass(), "strange", nullptr);
  SceneScope const inner(*g_db);
  Database own;
  SceneScope const scope(own);
  auto* node = static_cast<Node*>(own.createModule(&Node::staticClass(), "own", nullptr));
  EXPECT_FALSE(node->addChild(strange) || own.setPrimarySelectedModule(strange) ||
               own.removeFromScene(strange, true, true, true, true));
  EXPECT_FALSE(own.createModule(&Node::staticClass(), "below", strange));
  own.setPrioritySearchModule(strange);
  EXPECT_FALSE(own.getPriorityModule());
  auto* friends = static_cast<ModAttribute*>(
      node->addCustomAttribute(Attribute::create(Attribute::ModuleReference, "f")));
  friends->setValue(strange, true, true, true, true);
  node->addConnectingLine(MarkerConnection(static_cast<Node*>(strange)));
  EXPECT_TRUE(!friends->getValue() && node->getNumConnectingLines() == 0);
  std::unique_ptr<Marker> made;
  {
    SceneScope const again(other);
    made.reset(Marker::createInstance());
  }
  EXPECT_FALSE(own.addToScene(made.get(), true, nullptr, false, true));
}

}  // namespace
