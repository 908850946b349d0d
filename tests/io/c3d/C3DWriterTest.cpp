// What is written is read back equal, and what cannot be written is told.
#include <gtest/gtest.h>
#include <limits>

#include "host/time/Ticks.h"
#include "io/FileError.h"
#include "io/TakeFormats.h"
#include "tests/io/c3d/C3DTestFiles.h"

namespace talix {
namespace {

auto const kAlways = [](int, int64) { return true; };

Take writtenAndRead(Take const& take, std::vector<TakeNote>& notes) {
  TempFolder const folder;
  writeC3D(sourceOf(take), folder.path("written.c3d"), notes);
  return readC3D(folder.path("written.c3d"));
}

TEST(C3DWriter, KeepsRealTakes) {
  for (char const* file : {"walkset_a_le_int", "walkset_a_vax_real", "gait_results_events_01", "push_nan_01",
                           "single_frame_01", "malformed_paramoffset_01"}) {
    Take const take = readC3D(dataFile(file + std::string(".c3d")));
    std::vector<TakeNote> notes;
    Take const again = writtenAndRead(take, notes);
    EXPECT_EQ(differenceOf(take, again, 1e-6), "") << file;
    EXPECT_EQ(again.variant, "Intel, float");
    EXPECT_TRUE(notes.empty()) << notes[0].text;
    for (TakeNote const& note : again.notes) EXPECT_EQ(note.level, TakeNote::Level::Info) << note.text;
    // What has become four-byte reals once stays as it is.
    EXPECT_EQ(differenceOf(again, writtenAndRead(again, notes), 1e-15), "") << file;
  }
}

TEST(C3DWriter, KeepsMoreThan255PointsAndEvents) {
  Take take = movingPoints(600, 3, kAlways);
  for (size_t i = 0; i < take.points.size(); ++i) {
    take.points[i].subject = i % 2 ? "Left" : "Right";
    take.points[i].description = "point number " + std::to_string(i);
  }
  for (int i = 0; i < 300; ++i)
    take.events.push_back({"E" + std::to_string(i), "General", "Left", "", 0.5 * i});
  take.up = Axis::Y;
  std::vector<TakeNote> notes;
  EXPECT_EQ(differenceOf(take, writtenAndRead(take, notes), 0), "");
  EXPECT_TRUE(notes.empty());
}

TEST(C3DWriter, KeepsFrameNumbersAndCountsBeyond16Bits) {
  for (int64 const first : {int64{0}, int64{1}, int64{500}, int64{70'000}})
    for (int64 const frames :
         {int64{40'000}, int64{65'535}, int64{65'536}, int64{65'536 + 90}, int64{140'000}}) {
      Take take = movingPoints(1, frames, [](int, int64 f) { return f % 100 != 7; });
      KeyTrack& positions = take.points[0].positions;
      KeyTrack moved(KeyTrack::Shape::Vector);
      positions.forEach(0, positions.count(), [&](KeyTrack::Key const& key) {
        moved.set(key.time + (first - 1) * ticksPerFrameAt(take.rate), key.values);
      });
      positions = moved;
      take.firstFrame = first;
      std::vector<TakeNote> notes;
      Take const again = writtenAndRead(take, notes);
      EXPECT_TRUE(notes.empty());
      EXPECT_EQ(differenceOf(take, again, 0), "");
      EXPECT_FALSE(hasNote(again.notes, TakeNote::Level::Warning, "")) << again.notes.back().text;
    }
}

TEST(C3DWriter, KeepsGapsResidualsAndCameras) {
  Take take = movingPoints(3, 300, [](int p, int64 f) { return p == 0 || (p == 1 && (f < 10 || f > 290)); });
  take.fileUnit = "cm";
  take.unitInMillimetres = 10;
  TakePoint& point = take.points[1];
  point.positions.forEach(0, point.positions.count(), [&](KeyTrack::Key const& key) {
    point.residuals.set(key.time, {0.25 * static_cast<double>(key.time / ticksPerFrameAt(100) % 7)});
  });
  point.cameras.assign(300, 0);
  point.cameras[5] = 0x7f;
  point.cameras[295] = 0x11;
  take.points.push_back({});  // without a label and never seen
  std::vector<TakeNote> notes;
  EXPECT_EQ(differenceOf(take, writtenAndRead(take, notes), 1e-6), "");
  EXPECT_TRUE(notes.empty());
}

TEST(C3DWriter, TellsWhatIsNotWritten) {
  Take take = movingPoints(2, 10, kAlways);
  int64 const period = ticksPerFrameAt(100);
  KeyTrack& positions = take.points[0].positions;
  positions.set(3 * period + 1, {1, 2, 3});
  positions.set(3 * period + 2, {1, 2, 3});
  positions.set(50 * period, {1, 2, 3});
  positions.erase(positions.find(5 * period), 2);
  take.points[1].positions.set(2 * period, {std::numeric_limits<double>::infinity(), 0, 0});
  take.joints.resize(2);
  take.analogRate = 250;
  take.analog.resize(3);
  std::vector<TakeNote> notes;
  Take const again = writtenAndRead(take, notes);
  for (char const* text : {"2 keys of M0 lie between frames", "1 keys of M0 lie outside the take's frames",
                           "1 keys of M0 have no value on some axes", "2 joints are not written",
                           "3 analog channels are not written", "1 positions are no numbers"})
    EXPECT_TRUE(hasNote(notes, TakeNote::Level::Warning, text)) << text;
  EXPECT_EQ(notes.size(), 6u);
  EXPECT_EQ(again.points[0].positions.count(), 9);
  EXPECT_EQ(again.points[1].positions.count(), 9);
  EXPECT_TRUE(again.analog.empty());
}

TEST(C3DWriter, ReplacesMissingSamplesAndLowFrameNumbersWithANote) {
  Take take = movingPoints(1, 4, kAlways);
  take.firstFrame = -2;
  take.points[0].positions.clear();
  take.points[0].positions.set(-2 * ticksPerFrameAt(100), {1, 2, 3});
  take.analogRate = 200;
  take.analog.resize(1);
  take.analog[0].samples.set(-3 * ticksPerFrameAt(200), {7.5});
  std::vector<TakeNote> notes;
  Take const again = writtenAndRead(take, notes);
  EXPECT_TRUE(hasNote(notes, TakeNote::Level::Warning, "frame -2 is written as frame 1"));
  EXPECT_TRUE(hasNote(notes, TakeNote::Level::Warning, "7 analog samples are missing"));
  ASSERT_EQ(again.points[0].positions.count(), 1);
  EXPECT_EQ(again.points[0].positions.timeAt(0), ticksPerFrameAt(100));
  ASSERT_EQ(again.analog[0].samples.count(), 8);
  EXPECT_EQ(again.analog[0].samples.at(1).values[0], 7.5);
}

TEST(C3DWriter, LeavesTheOldFileWhenTheTakeIsImpossible) {
  TempFolder const folder;
  std::string const path = folder.file("kept.c3d", "old");
  Take take = movingPoints(1, 2, kAlways);
  take.rate = 0;
  std::vector<TakeNote> notes;
  EXPECT_THROW(writeC3D(sourceOf(take), path, notes), FileError);
  take.rate = 100;
  take.points.resize(65'536);
  EXPECT_THROW(writeC3D(sourceOf(take), path, notes), FileError);
  EXPECT_EQ(readText(path), "old");
}

}  // namespace
}  // namespace talix
