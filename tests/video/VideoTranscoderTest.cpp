// Videos that are made here, transcoded, and decoded again.
#include <cmath>
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "host/base/Log.h"
#include "host/scene/Database.h"
#include "host/scene/Devices.h"
#include "host/services/OperationStack.h"
#include "host/services/VideoTranscoder.h"
#include "tests/TempFolder.h"
#include "tests/video/VideoFile.h"

namespace {

using Overlay = Nex::IBurnInTimecodeSettings;
using testing::ElementsAre;
using testing::HasSubstr;

class Videos : public testing::Test, private LogSink {
 protected:
  struct Wish {
    char const* payload = "mpeg4";
    int quality = 100;
    bool removeAudio = false;
    std::optional<Overlay> overlay = std::nullopt;
    std::optional<float> saturation = std::nullopt, gamma = std::nullopt;
    bool undistort = false, centre = false;
  };

  Videos() : m_former(setLogSink(this)) { g_db->newScene(); }
  ~Videos() override {
    setLogSink(m_former);
    g_db->newScene();
  }

  // What was logged; "done" when all went well.
  std::string transcode(std::string const& from, std::string const& to, Wish const& wish) {
    lines.clear();
    bool const done = VideoTranscoder().process(folder.path(from), folder.path(to), wish.payload,
                                                wish.quality, wish.removeAudio, wish.overlay, wish.saturation,
                                                wish.gamma, wish.undistort, wish.centre);
    return lines + (done ? "done" : "");
  }
  VideoFile transcoded(VideoFile const& file, Wish const& wish, char const* to = "to.mov") {
    file.write(folder.path("from.mov"));
    EXPECT_EQ(transcode("from.mov", to, wish), "done");
    return VideoFile::read(folder.path(to));
  }
  std::vector<std::string> names() const {
    std::vector<std::string> all;
    for (auto const& entry : std::filesystem::directory_iterator(folder.path("")))
      all.push_back(entry.path().filename().string());
    return all;
  }
  OpticalCamera* selectCamera(double f, double cx, double cy) {
    auto* camera =
        static_cast<OpticalCamera*>(g_db->createModule(&OpticalCamera::staticClass(), "camera", nullptr));
    Matrix intrinsics(3);
    intrinsics[0][0] = intrinsics[1][1] = f, intrinsics[0][2] = cx, intrinsics[1][2] = cy,
    intrinsics[2][2] = 1;
    static_cast<MatrixAttribute*>(camera->getAttribute("Intrinsics"))
        ->setValue(intrinsics, true, true, true, true);
    camera->setSelected(true);
    return camera;
  }

  talix_tests::TempFolder folder;

 private:
  void write(LogLevel level, std::string_view text) override {
    lines += std::string(getLogLevelName(level)) + ": " + std::string(text) + "\n";
  }
  LogSink* m_former;
  std::string lines;
};

// The brightness' centre above a level.
std::pair<double, double> brightSpot(VideoFile::Picture const& picture, int level) {
  double x = 0, y = 0, count = 0;
  for (size_t i = 0; i < picture.y.size(); ++i) {
    if (picture.y[i] < level) continue;
    x += static_cast<double>(i % static_cast<size_t>(picture.width)) + 0.5;
    y += static_cast<double>(i / static_cast<size_t>(picture.width)) + 0.5;
    ++count;
  }
  return {x / count, y / count};
}

TEST_F(Videos, KeepPicturesTimesTimecodeAndSound) {
  VideoFile file = VideoFile::plain(25);
  file.rate = 30000, file.perSeconds = 1001;
  // From the tenth on they come late, and between the frames.
  for (size_t i = 0; i < 25; ++i)
    file.pictures[i].time = static_cast<double>(i) * (i < 10 ? 1 : 2.5) * 1001 / 30000;
  file.timecode = "01:00:59;28", file.sound = "pcm_s16le", file.turned = true, file.aspect = 2;
  for (char const* payload : {"mpeg4", "libx264:ultrafast", ""}) {
    for (char const* to : {"to.mov", "to.mp4"}) {
      VideoFile const made = transcoded(file, {.payload = payload}, to);
      ASSERT_EQ(made.pictures.size(), 25u);
      for (size_t i = 0; i < 25; ++i) {
        EXPECT_NEAR(made.pictures[i].time, file.pictures[i].time, 1e-6) << payload << to << i;
        EXPECT_NEAR(made.pictures[i].mean(made.pictures[i].y), file.pictures[i].mean(file.pictures[i].y), 2);
      }
      EXPECT_EQ(made.timecode, file.timecode);
      EXPECT_TRUE(made.turned);
      EXPECT_EQ(made.aspect, 2);
      EXPECT_EQ(made.sound, std::string(to) == "to.mov" ? "pcm_s16le" : "aac");
      if (made.sound == file.sound) {
        EXPECT_EQ(made.soundBytes, 25u * 4 * 1601);
      }
    }
  }
  EXPECT_EQ(transcoded(file, {.removeAudio = true}).sound, "");
  VideoFile const regular = transcoded(VideoFile::plain(25), {}, "to.mkv");
  EXPECT_EQ(regular.rate, 25 * regular.perSeconds);
  auto const sizeAt = [&](int quality) {
    transcoded(file, {.quality = quality, .removeAudio = true});
    return std::filesystem::file_size(folder.path("to.mov"));
  };
  EXPECT_LT(sizeAt(1), sizeAt(100));
}

TEST_F(Videos, BurnTheTimecodeIntoOneCornerOnly) {
  VideoFile file = VideoFile::plain(2);
  file.timecode = "01:00:00:00";
  VideoFile const without = transcoded(file, {});
  for (int position = 0; position < 6; ++position) {
    VideoFile const with = transcoded(file, {.overlay = Overlay{position, 0, 0, 0, 1}});
    int changed = 0, wrong = 0;
    for (size_t i = 0; i < with.pictures[0].y.size(); ++i) {
      if (std::abs(with.pictures[0].y[i] - without.pictures[0].y[i]) < 30) continue;
      ++changed;
      if ((i / VideoFile::kWidth >= VideoFile::kHeight / 2) != (position >= 3)) ++wrong;
    }
    EXPECT_GT(changed, 200) << position;
    EXPECT_EQ(wrong, 0) << position;
  }
  // It counts, from the file's own one, and without one from 0.
  Wish const overlay{.overlay = Overlay{0, 0, 0, 0, 0}};
  VideoFile const first = transcoded(file, overlay);
  EXPECT_NE(first.pictures[0].y, first.pictures[1].y);
  file.timecode = "00:00:00:00";
  std::vector<uint8_t> const zero = transcoded(file, overlay).pictures[0].y;
  EXPECT_NE(zero, first.pictures[0].y);
  file.timecode.clear();
  EXPECT_EQ(transcoded(file, overlay).pictures[0].y, zero);
}

TEST_F(Videos, ChangeSaturationAndGamma) {
  VideoFile const grey = transcoded(VideoFile::plain(3), {.saturation = 0.f});
  for (uint8_t const u : grey.pictures[1].u) EXPECT_NEAR(u, 128, 1);
  for (uint8_t const v : grey.pictures[1].v) EXPECT_NEAR(v, 128, 1);
  VideoFile const bright = transcoded(VideoFile::plain(3), {.gamma = 2.f});
  // 80 of 255, its root taken
  EXPECT_NEAR(bright.pictures[0].y[0], 143, 4);
  EXPECT_NEAR(bright.pictures[0].u[0], 90, 2);
}

TEST_F(Videos, UseTheLensOfThePrimaryCamera) {
  VideoFile const file = VideoFile::plain(2);
  file.write(folder.path("from.mov"));
  for (Wish const& wish : {Wish{.undistort = true}, Wish{.centre = true}})
    EXPECT_EQ(transcode("from.mov", "to.mov", wish),
              "error: Select an OpticalCamera whose lens is to be used.\n");
  OpticalCamera* camera = selectCamera(40, 40, 20);
  auto const [x, y] = brightSpot(transcoded(file, {.centre = true}).pictures[0], 180);
  EXPECT_NEAR(x, 52 - 8, 0.3);
  EXPECT_NEAR(y, 36 + 4, 0.3);
  EXPECT_EQ(brightSpot(transcoded(file, {.undistort = true}).pictures[0], 180), std::pair(52.0, 36.0));
  auto* k1 =
      static_cast<FloatAttribute*>(camera->addCustomAttribute(Attribute::create(Attribute::Float, "K1")));
  k1->setValue(0.5, true, true, true, true);
  // The ideal point whose ray is seen in the square's middle: a bit nearer.
  double r = 0;
  double const seen = std::hypot(12, 16) / 40;
  for (int i = 0; i < 100; ++i) r = seen / (1 + 0.5 * r * r);
  auto const [u, v] = brightSpot(transcoded(file, {.undistort = true}).pictures[0], 180);
  EXPECT_NEAR(u, 40 + 12 * r / seen, 0.4);
  EXPECT_NEAR(v, 20 + 16 * r / seen, 0.4);
}

TEST_F(Videos, SayWhatIsWrongAndLeaveNothing) {
  VideoFile file = VideoFile::plain(25);
  file.sound = "pcm_s16le";
  for (char const* suffix : {"mov", "mkv", "avi"}) {
    std::string const name = std::string("whole.") + suffix;
    file.write(folder.path(name));
    EXPECT_EQ(transcode(name, "to.avi", {}), "done") << suffix;
    EXPECT_EQ(VideoFile::read(folder.path("to.avi")).pictures.size(), 25u) << suffix;
    std::string const all = talix_tests::readText(folder.path(name));
    folder.file(std::string("cut.") + suffix, all.substr(0, all.size() * 6 / 10));
    std::filesystem::remove(folder.path(name));
  }
  std::filesystem::remove(folder.path("to.avi"));
  folder.file("empty.mov", "");
  folder.file("text.mov", "These are words and no pictures.\n");
  folder.file("list.ffconcat", "ffconcat version 1.0\nfile cut.mov\n");
  std::string wav(
      "RIFF\x24\x10\0\0WAVEfmt \x10\0\0\0\1\0\1\0\x40\x1f\0\0\x80\x3e\0\0\2\0\x10\0data\0\x10\0\0", 44);
  folder.file("sound.wav", wav + std::string(4096, '\1'));
  file.write(folder.path("good.mov"));
  std::vector<std::string> const before = names();
  for (auto const& [from, why] : {std::pair{"none.mov", "No such file or directory"},
                                  {"empty.mov", "the file is empty"},
                                  {"text.mov", "not a video"},
                                  {"", "not a file"},
                                  {"list.ffconcat", "a list of other files"},
                                  {"sound.wav", "there is no video in the file"},
                                  {"cut.mov", "not a whole video"},
                                  {"cut.mkv", "the file ends before its video does"},
                                  {"cut.avi", "the file ends before its video does"}}) {
    std::string const said = transcode(from, "to.mov", {});
    EXPECT_THAT(said, testing::StartsWith("error: " + folder.path(from) + ": ")) << from;
    EXPECT_THAT(said, HasSubstr(why)) << from;
    EXPECT_EQ(std::count(said.begin(), said.end(), '\n'), 1) << said;
  }
  EXPECT_THAT(transcode("good.mov", "to.txt", {}), HasSubstr("\".txt\" is the suffix of no video file"));
  EXPECT_THAT(transcode("good.mov", "no/to.mov", {}),
              HasSubstr("cannot be written: No such file or directory"));
  EXPECT_THAT(transcode("good.mov", "to.mov", {.payload = "x"}),
              HasSubstr("there is no video encoder \"x\""));
  EXPECT_THAT(transcode("good.mov", "to.mov", {.payload = "libx264:x"}),
              HasSubstr("libx264 has no preset \"x\""));
  EXPECT_THAT(transcode("good.mov", "to.mov", {.quality = 0}), HasSubstr("1 to 100"));
  EXPECT_THAT(transcode("good.mov", "to.mov", {.gamma = 0.f}), HasSubstr("0.1 to 10"));
  // The user cancels at the first progress that is shown.
  g_theOperationStack.setDisplay([](OperationStack::Task const* task) {
    if (task && task->position > 0) g_theOperationStack.cancel();
  });
  EXPECT_EQ(transcode("good.mov", "to.mov", {}), "");
  g_theOperationStack.setDisplay(nullptr);
  EXPECT_EQ(g_theOperationStack.getNumTasks(), 0);
  g_theOperationStack.reset();
  EXPECT_EQ(names(), before);
}

TEST_F(Videos, MayReplaceTheirSource) {
  VideoFile::plain(25).write(folder.path("a.mp4"));
  EXPECT_EQ(transcode("a.mp4", "a.mp4", {.saturation = 0.f}), "done");
  VideoFile const made = VideoFile::read(folder.path("a.mp4"));
  EXPECT_EQ(made.pictures.size(), 25u);
  EXPECT_NEAR(made.pictures[24].u[0], 128, 1);
  EXPECT_THAT(names(), ElementsAre("a.mp4"));
}

TEST_F(Videos, AreThoseOfRealCameras) {
  std::filesystem::copy(TALIX_TEST_DATA "/person_01.mp4", folder.path("from.mp4"));
  VideoFile const file = VideoFile::read(folder.path("from.mp4"));
  ASSERT_EQ(transcode("from.mp4", "to.mp4", {}), "done");
  VideoFile const made = VideoFile::read(folder.path("to.mp4"));
  ASSERT_EQ(made.pictures.size(), file.pictures.size());
  EXPECT_EQ(made.rate * file.perSeconds, file.rate * made.perSeconds);
  EXPECT_NEAR(made.pictures.back().time, file.pictures.back().time, 1e-6);
}

}  // namespace
