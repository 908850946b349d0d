// What small files cannot show; those stand in the listing of all takes.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "io/TakeFormats.h"
#include "tests/io/TakeTesting.h"

namespace talix {
namespace {

TEST(TrcReader, TheUnitGivenGoesBeforeTheFiles) {
  std::string const path = dataFile("small/unit_m.trc");
  Take const take = readTRC(path, {.unit = "in"});
  EXPECT_LT((Vec3(take.points[0].positions.at(0).values.data()) - Vec3(25.4, 50.8, 76.2)).length(), 1e-9);
  EXPECT_EQ(take.up, Axis::Z) << "metres, whose up axis is y, are not meant";
  EXPECT_THAT(errorOf([&] { readTRC(path, {.unit = "ell"}); }),
              testing::HasSubstr("the unit \"ell\" is not known"));
}

// Long enough for several runs of keys, with gaps at their borders.
TEST(TrcReader, LongTakesKeepEveryKey) {
  std::string text =
      "PathFileType\t4\t(X/Y/Z)\tx.trc\nDataRate\tNumMarkers\tUnits\n100\t2\tmm\n"
      "Frame#\tTime\tA\t\t\tB\n\t\tX1\tY1\tZ1\tX2\tY2\tZ2\n\n";
  for (int frame = 1; frame <= 2000; ++frame) {
    std::string const number = std::to_string(frame);
    text += number + "\t" + std::to_string((frame - 1) * 0.01) + "\t" +
            (frame % 257 == 0 ? "\t\t" : number + "\t0.5\t-" + number) + "\t1\t1\t" + number + "\n";
  }
  TempFolder const folder;
  Take const take = readTRC(folder.file("long.trc", text));
  EXPECT_EQ(take.points[0].positions.count(), 2000 - 2000 / 257);
  EXPECT_EQ(take.points[1].positions.count(), 2000);
  take.points[0].positions.forEach(0, take.points[0].positions.count(), [&](KeyTrack::Key const& key) {
    ASSERT_EQ(key.values[0], static_cast<double>(key.time / ticksPerFrameAt(100)));
  });
  EXPECT_EQ(Vec3(take.points[1].positions.at(1999).values.data()), Vec3(1, 1, 2000));
}

TEST(TrcReader, DamagedFilesGiveATakeOrAnError) {
  auto const reader = [](std::string const& path) { return readTRC(path); };
  expectSurvivesDamage(readText(dataFile("nan_case_01.trc")), ".trc", 3, 1500, reader);
  expectSurvivesDamage(readText(dataFile("unlabelled_only_01.trc")).substr(0, 12000), ".trc", 101, 300,
                       reader);
}

}  // namespace
}  // namespace talix
