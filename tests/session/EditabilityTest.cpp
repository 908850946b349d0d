// What every writer does where something stands in its way.
#include <gtest/gtest.h>
#include <map>

#include "host/scene/Database.h"
#include "session/Session.h"

namespace {

struct Lock {
  char const* name;
  char const* lines[3];
};

// The layer is locked by hand, since no command does it.
constexpr Lock kLocks[] = {
    {"nothing", {}},
    {"channels",
     {"lockChannel b\\m Translation on", "lockChannel b\\m Rotation on", "lockChannel b\\m Scale on"}},
    {"module", {"setProperty Locked on -onMod b\\m"}},
    {"layer", {}},
    {"clip", {"setProperty Locked on -onMod take"}},
    {"blend", {"setActiveClip mix"}},
    {"base clip", {"setActiveClip -none"}}};
constexpr size_t kLayer = 3;

struct Writer {
  char const* line;
  // By lock: what changed on the module (K keys, D default value or interpolation, P pre-transform), "!" a
  // warning, "x" a failure; "." nothing at all.
  char const* effects[std::size(kLocks)];
  char const* selection = "select b\\m";
};

constexpr Writer kWriters[] = {
    //                                    nothing channels module layer clip blend base
    {"setKey Translation 1 2 3", {"K", ".", ".", ".", ".", ".", "."}},
    {"setKey Translation 1 2 3 -onMod b\\m", {"K", "x", "x", "x", "x", "x", "x"}},
    {"createKey", {"K", ".", ".", ".", ".", ".", "."}},
    {"setInterpType Translation Constant", {"D", "D", "D", "D", "D", "D", "x"}},
    {"setProperty Translation 1 2 3", {"K", "K", "K", "K", "K", ".", "."}},
    {"setProperty Translation 1 2 3 -onMod b\\m", {"K", "K", "K", "K", "K", ".", "."}},
    {"setProperty Rotation 1 2 3", {"K", ".", ".", ".", ".", ".", "."}},
    {"setProperty Rotation 1 2 3 -onMod b\\m", {"K", "K", "K", "K", "K", ".", "."}},
    {"setProperty Translation 1 2 3 -d", {"D", "D", "D", "D", "D", "D", "D"}},
    {"setProperty Rotation 1 2 3 -d", {"D", ".", ".", ".", ".", ".", "."}},
    {"setProperty Rotation 1 2 3 -d -onMod b\\m", {"D", "D", "D", "D", "D", "D", "D"}},
    {"pasteKeys", {"K", "!", "!", "!", "!", "!", "!"}},
    {"cutKeys", {"K", ".", ".", ".", ".", ".", "."}},
    {"cutKeys -all -allLayers", {"K", ".", ".", ".", ".", ".", "."}},
    {"reduceKeys -all", {"K", ".", ".", ".", ".", ".", "."}},
    {"setPosition b\\m <1 2 3>", {"K", "!", "!", "!", "!", "!", "D"}},
    {"setPosition b\\m <1 2 3> -ws -default", {"KD", "!", "!", "D", "D", "D", "D"}},
    {"setPosition b\\m <1 2 3> -preTrans", {"KP", "KP", "!", "P", "P", "P", "P"}},
    {"setRotation b\\m <1 2 3> -ws", {"K", "!", "!", "!", "!", "!", "D"}},
    {"setRotation b\\m <1 2 3> -def", {"D", "!", "!", "D", "D", "D", "D"}},
    {"setRotation b\\m <1 2 3> -preRot", {"KP", "P!", "!", "P!", "P!", "P!", "DP"}},
    {"setRotationAngleAxis b\\m <1 2 3>", {"K", "!", "!", "!", "!", "!", "D"}},
    {"setRotationAngleAxis b\\m <1 2 3> -ws -preRot", {"KP", "P!", "!", "P!", "P!", "P!", "DP"}},
    {"setScale b\\m <1 2 3>", {"K", "!", "!", "!", "!", "!", "D"}},
    {"setScale b\\m <1 2 3> -def", {"D", "!", "!", "D", "D", "D", "D"}},
    {"setBoneLength 5", {"P", "P", "!", "P", "P", "P", "P"}, "select b"},
    {"copyData \\s\\m.Translation \\b\\m.Translation", {"KD", "x", "x", "KD!", "x", "x", "x"}},
    // Other channels of the module are copied where some are locked.
    {"collapse", {"KD", "K", "!", "KD!", "!", "!", "x"}, "select s b"},
};

class Editability : public testing::Test {
 protected:
  Editability() { m_session.setAssumeYes(true); }
  ~Editability() override {
    g_db->newScene();
    Database::setDevOnlyMode(false);
  }

  std::string run(std::string const& line) {
    talix::LineResult const& result = m_session.run(line);
    std::string said = result.failed() ? "x" : "";
    for (talix::LogLine const& logged : result.log)
      if (logged.level == LogLevel::Warning) said = "!";
    return said;
  }
  // Two layers with keys in both, the upper one active; "\s\m" to copy from; all keys of "\b\m" selected.
  void build(char const* selection) {
    for (char const* line :
         {"newScene", "create Clip take", "create BlendClip mix", "create SolvingBone b s",
          "create Marker m -parent b", "create Marker m -parent s", "setPosition b\\m <0 0 9> -preTrans",
          "addLayer", "setProperty Translation 7 7 7 -d -onMod s\\m", "selectChannels Translation"})
      run(line);
    for (int i = 0; i < 24; ++i) {
      std::string const x = std::to_string(i % 6), module = i / 6 % 2 ? "b\\m" : "s\\m";
      run("setActiveLayer " + std::to_string(i / 12));
      run("setKey Translation " + x + " " + std::to_string(i / 6) + " 0 -t " + x + " -onMod " + module);
      run("setKey Rotation " + x + " 0 0 -t " + x + " -onMod " + module);
    }
    for (char const* line : {"select s\\m", "copyKeys -all", "setTime 9", "select b\\m",
                             "selectKeys Translation -all", "selectKeys Rotation -all -add"})
      run(line);
    run(selection);
  }
  void lock(Lock const& lock) {
    for (char const* line : lock.lines)
      if (line) run(line);
    if (&lock == &kLocks[kLayer]) g_db->getHeadClip()->setLayerLocked(1, true);
  }

  static Node const& target() {
    return *static_cast<Node const*>(g_db->getModuleWithPath("\\b\\m", nullptr, false));
  }
  struct State {
    explicit State(Node const& node) : pre(node.getPreTranslation(), node.getPreRotation()) {
      for (int i = 0; i < node.getNumChannels(); ++i) {
        Controller const& channel = *node.getChannel(i);
        std::string const name = channel.getName().GetString();
        settings[name] = {channel.getDefaultValues(), channel.getInterpolation()};
        for (int layer = 0; layer < 2; ++layer)
          if (KeyTrack const* track = channel.findTrack(g_db->getHeadClip(), layer); track && !track->empty())
            tracks.emplace(name + std::to_string(layer), *track);
      }
    }
    std::string difference(State const& now) const {
      return std::string(tracks == now.tracks ? "" : "K") + (settings == now.settings ? "" : "D") +
             (pre == now.pre ? "" : "P");
    }
    std::pair<Vec3, TalixRotation> pre;
    std::map<std::string, std::pair<Controller::Values, Interpolation>> settings;
    std::map<std::string, KeyTrack> tracks;  // by channel and layer
  };

  static std::string library() {
    Database::setDevOnlyMode(true);
    return TALIX_BIN "/TalixDataCommands.so";
  }
  talix::Session m_session{library()};
};

TEST_F(Editability, OfEveryWriter) {
  for (Writer const& writer : kWriters)
    for (size_t i = 0; i < std::size(kLocks); ++i) {
      build(writer.selection);
      lock(kLocks[i]);
      State const before(target());
      std::string const said = run(writer.line);
      std::string const effect = before.difference(State(target())) + said;
      EXPECT_EQ(effect.empty() ? "." : effect, writer.effects[i])
          << writer.line << ", locked: " << kLocks[i].name;
    }
}

}  // namespace
