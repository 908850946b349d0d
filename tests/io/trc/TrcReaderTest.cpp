#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "io/TakeFormats.h"
#include "tests/io/TakeTesting.h"

namespace talix {
namespace {

using testing::HasSubstr;
using testing::Not;

struct RealTake {
  const char* file;
  size_t points;
  int64 firstFrame, frames, gaps;
  double rate;
  const char* unit;
  const char* firstLabel;
  const char* lastLabel;
  Vec3 firstPlace;  // of the first point, file units
  Vec3 lastPlace;   // the last key of the last point
};

void PrintTo(const RealTake& take, std::ostream* out) { *out << take.file; }

class TrcRealTake : public testing::TestWithParam<RealTake> {};

Vec3 placeOf(const TakePoint& point, int64 index) { return Vec3(point.positions.at(index).values.data()); }

TEST_P(TrcRealTake, HasTheFileFigures) {
  const RealTake& expected = GetParam();
  const Take take = readTRC(dataFile(expected.file));
  ASSERT_EQ(take.points.size(), expected.points);
  EXPECT_EQ(take.firstFrame, expected.firstFrame);
  EXPECT_EQ(take.frameCount, expected.frames);
  EXPECT_EQ(take.rate, expected.rate);
  EXPECT_EQ(take.fileUnit, expected.unit);
  EXPECT_EQ(take.up, take.fileUnit == "m" ? Axis::Y : Axis::Z);
  EXPECT_EQ(take.points.front().label, expected.firstLabel);
  EXPECT_EQ(take.points.back().label, expected.lastLabel);
  int64 gaps = 0;
  for (const TakePoint& point : take.points) {
    gaps += expected.frames - point.positions.count();
    ASSERT_STREQ(point.positions.checkInvariants(), "");
  }
  EXPECT_EQ(gaps, expected.gaps);
  const KeyTrack& last = take.points.back().positions;
  EXPECT_EQ(take.points.front().positions.timeAt(0) % ticksPerFrameAt(take.rate), 0);
  EXPECT_LE((placeOf(take.points.front(), 0) - expected.firstPlace * take.unitInMillimetres).length(), 1e-9);
  EXPECT_LE(
      (placeOf(take.points.back(), last.count() - 1) - expected.lastPlace * take.unitInMillimetres).length(),
      1e-9);
}

INSTANTIATE_TEST_SUITE_P(
    Files, TrcRealTake,
    testing::Values(RealTake{"exp_format_01.trc", 14, 1, 5, 0, 119.88012, "m", "RFAsuperior", "RFAulna",
                             Vec3(-0.273, 0.0746, -1.57), Vec3(-0.164, 0.072, -1.42)},
                    RealTake{"header_count_01.trc", 41, 185, 73, 0, 60.0, "mm", "R.ASIS", "Top.Head",
                             Vec3(596.88123, 1044.68286, 118.56002), Vec3(635.27277, 1780.5918, -25.19363)},
                    RealTake{"malformed_shifted_01.trc", 61, 1, 281, 0, 100.0, "m", "LFHD", "LWRA",
                             Vec3(-1.8425, 1.573, -0.27479), Vec3(2.3979, 0.94017, -0.42299)},
                    RealTake{"markerless_01.trc", 21, 1, 100, 0, 60.0, "m", "RHip", "LWrist",
                             Vec3(-0.06497214796810755, 0.9015045550714222, -1.4005886926185436),
                             Vec3(0.45750045894711305, 1.5475270757731838, -0.3871462895406637)},
                    RealTake{"nan_case_01.trc", 14, 1, 5, 5, 250.0, "mm", "toe", "lASIS",
                             Vec3(175.798014, -333.753526, 33.121135),
                             Vec3(-33.771392, 498.944402, 196.73872)},
                    RealTake{"nan_m_01.trc", 51, 1, 136, 129, 100.0, "m", "C7", "r_toe",
                             Vec3(-0.341529, 1.53197, -0.236979), Vec3(1.68427, 0.0565279, -0.0843166)},
                    RealTake{"small_10_frames_01.trc", 41, 1, 10, 0, 60.0, "mm", "R.ASIS", "Top.Head",
                             Vec3(617.24762, 1055.27502, 170.78198), Vec3(752.89178, 1758.74548, 1.274)},
                    RealTake{"space_header_01.trc", 41, 1, 238, 0, 100.0, "mm", "R.Shoulder", "L.Toe",
                             Vec3(-652.63, 1529.542, -94.52), Vec3(2461.683, 52.199, -296.859)},
                    RealTake{"sprint_01.trc", 70, 1, 337, 0, 250.0, "mm", "C7", "",
                             Vec3(-104.45724, 89.31086, 1479.24023), Vec3(-281.35367, 80.83158, 1046.12817)},
                    RealTake{"synthetic_m_01.trc", 31, 1, 73, 0, 60.0, "m", "Sternum", "L.Toe.Tip",
                             Vec3(0.67076, 1.3961, -0.025106), Vec3(0.70121, 0.049148, -0.041512)},
                    RealTake{"unlabelled_only_01.trc", 10, 1, 882, 6678, 400.0, "mm", "", "",
                             Vec3(19.91857, 1362.1875, -124.33382), Vec3(-26.17541, 526.26477, -348.95346)},
                    RealTake{"wheelchair_01.trc", 34, 1, 128, 0, 100.0, "mm", "R.Poignee", "L.D2M1",
                             Vec3(-200.79666, -116.6578, 721.55182), Vec3(325.03568, 132.55153, 711.16071)}),
    [](const auto& given) {
      const std::string name = given.param.file;
      return name.substr(0, name.find('.'));
    });

Take read(const std::string& text, const ReadOptions& options = {}) {
  const TempFolder folder;
  return readTRC(folder.file("take.trc", text), options);
}

const std::string kStart = "PathFileType\t4\t(X/Y/Z)\tx.trc\n";
const std::string kNames = "DataRate\tCameraRate\tNumFrames\tNumMarkers\tUnits\tOrigDataRate\n";
const std::string kTwoMarkers = "Frame#\tTime\tA\t\t\tB\t\t\n\t\tX1\tY1\tZ1\tX2\tY2\tZ2\n\n";
const std::string kHead = kStart + kNames + "100\t200\t3\t2\tmm\t100\n" + kTwoMarkers;

// The keys of a track as "frame=x y z".
std::string keys(const Take& take, size_t point) {
  std::string text;
  const KeyTrack& track = take.points.at(point).positions;
  track.forEach(0, track.count(), [&](const KeyTrack::Key& key) {
    char one[80];
    std::snprintf(one, sizeof one, "%s%lld=%g %g %g", text.empty() ? "" : "  ",
                  static_cast<long long>(key.time / ticksPerFrameAt(take.rate)), key.values[0], key.values[1],
                  key.values[2]);
    text += one;
  });
  return text;
}

TEST(TrcCells, EmptyNotANumberAndMissingCellsAreGaps) {
  const Take take = read(kHead +
                         "1\t0.00\t1\t2\t3\t4\t5\t6\n"
                         "2\t0.01\t\t \t\t4\t5\t6\n"
                         "3\t0.02\tnan\t-NaN\t-1.#IND\t4\t5\t6\n"
                         "4\t0.03\tNAN(ind)\t1\t1\t4\t5\t6\n"
                         "5\t0.04\t1\t2\t3\n"
                         "6\t0.05\t1\t2\t3\t4\t5\n"
                         "7\t0.06\n"
                         "8\t0.07\t1e1\t-2.5E+00\t+3\t0\t0\t0\t\t\t\n");
  EXPECT_EQ(keys(take, 0), "1=1 2 3  5=1 2 3  6=1 2 3  8=10 -2.5 3");
  EXPECT_EQ(keys(take, 1), "1=4 5 6  2=4 5 6  3=4 5 6  4=4 5 6  8=0 0 0");
  EXPECT_EQ(take.frameCount, 8);
  EXPECT_EQ(take.rate, 100);
  const std::string notes = notesOf(take.notes);
  EXPECT_THAT(notes, HasSubstr("warning: 2 positions lack one or two coordinates and were taken as gaps"));
  EXPECT_THAT(notes,
              HasSubstr("warning: the header announces 3 frames, the file has 8 rows; the rows were taken"));
  EXPECT_THAT(notes, HasSubstr("warning: 1 of 9 positions are 0,0,0"));
}

TEST(TrcCells, BlanksAndLineEndsDoNotMatter) {
  const std::string rows = "1\t0.00\t1\t2\t3\t4\t5\t6\n2\t0.01\t1\t2\t3\t4\t5\t6\n";
  const std::string plain = kHead + rows;
  std::string crlf, cr;
  for (const char c : plain) crlf += c == '\n' ? "\r\n" : std::string(1, c), cr += c == '\n' ? '\r' : c;
  const std::string blanks =
      "\xEF\xBB\xBF\nPathFileType 4\n\nDataRate CameraRate NumFrames NumMarkers Units\n 100\t\t 200\t\t "
      "2\t\t\t2 \tmm\n"
      "Frame# Time A B\nX1 Y1 Z1 X2 Y2 Z2\n1 0.00  1 2 3   4 5 6\n\t\t\n\n2 \t 0.01\t1 \t2\t 3 4  5 6  \t";
  for (const std::string& text : {plain, crlf, cr, blanks}) {
    const Take take = read(text);
    ASSERT_EQ(take.points.size(), 2u);
    EXPECT_EQ(take.points[1].label, "B");
    EXPECT_EQ(take.rate, 100);
    EXPECT_EQ(keys(take, 0), "1=1 2 3  2=1 2 3");
    EXPECT_THAT(notesOf(take.notes), Not(HasSubstr("column")));
    EXPECT_EQ(keys(take, 1), "1=4 5 6  2=4 5 6");
  }
}

TEST(TrcHeader, WhatWasMendedIsSaid) {
  const std::pair<const char*, const char*> cases[] = {
      {"sprint_01.trc", "warning: 5 points have no name"},
      {"header_count_01.trc", "warning: the header announces 900 frames, the file has 73 rows"},
      {"malformed_shifted_01.trc", "warning: the header has 1 column more than the rows"},
      {"synthetic_m_01.trc", "info: the Time column starts with 0.4 s at frame 1"},
      {"unlabelled_only_01.trc", "warning: the header announces 0 markers, the file has 10"}};
  for (const auto& [file, note] : cases) EXPECT_THAT(notesOf(readTRC(dataFile(file)).notes), HasSubstr(note));
  // Takes in order need one line, on their axes.
  for (const char* file :
       {"wheelchair_01.trc", "markerless_01.trc", "space_header_01.trc", "exp_format_01.trc"})
    EXPECT_EQ(readTRC(dataFile(file)).notes.size(), 1u) << notesOf(readTRC(dataFile(file)).notes);
}

TEST(TrcHeader, NamesMayBeMissingShiftedOrHaveASubject) {
  const auto withNames = [](const std::string& names, const std::string& row) {
    return read(kStart + kNames + "100\t100\t1\t2\tmm\n" + names + row + "\n");
  };
  const Take subjects = withNames("Frame#\tTime\tAnn:L Hip\t\t\tB:\t\t\n", "1\t0\t1\t2\t3\t4\t5\t6");
  EXPECT_EQ(subjects.points[0].subject, "Ann");
  EXPECT_EQ(subjects.points[0].label, "L Hip");
  EXPECT_EQ(withNames("Frame#\tTime\tAnn:*12\n", "1\t0\t1\t2\t3").points[0].label, "");
  EXPECT_EQ(subjects.points[1].subject, "");
  EXPECT_EQ(subjects.points[1].label, "B:");

  const Take nameless = withNames("Frame#\tTime\t\t\t\tB\n", "1\t0\t1\t2\t3\t4\t5\t6\t7\t8\t9");
  ASSERT_EQ(nameless.points.size(), 3u);
  EXPECT_EQ(nameless.points[0].label, "");
  EXPECT_EQ(nameless.points[1].label, "B");
  EXPECT_EQ(keys(nameless, 2), "1=7 8 9");
  EXPECT_THAT(notesOf(nameless.notes), HasSubstr("warning: 1 points have no name"));
  EXPECT_THAT(notesOf(nameless.notes), HasSubstr("warning: the header announces 2 markers, the file has 3"));

  // One column more in the header: the rows show whether they have it too.
  const std::string shifted = "Frame#\tTime\t\tA\t\tB\n\t\t\tX1\tY1\tZ1\tX2\tY2\tZ2\n";
  const Take headerOnly = withNames(shifted, "1\t0\t1\t2\t3\t4\t5\t6");
  EXPECT_EQ(keys(headerOnly, 1), "1=4 5 6");
  EXPECT_EQ(headerOnly.points[1].label, "B");
  EXPECT_THAT(notesOf(headerOnly.notes), HasSubstr("warning: the header has 1 column more than the rows"));
  const Take rowsToo = withNames(shifted, "1\t0\t\t1\t2\t3\t4\t5\t6");
  EXPECT_EQ(keys(rowsToo, 1), "1=4 5 6");
  EXPECT_THAT(notesOf(rowsToo.notes),
              HasSubstr("warning: header and rows have 1 empty column before the first"));
  const Take noCoordinates = withNames("Frame#\tTime\tA\tB\n", "1\t0\t1\t2\t3\t4\t5\t6");
  EXPECT_EQ(noCoordinates.points[1].label, "B");
  EXPECT_THAT(notesOf(noCoordinates.notes),
              HasSubstr("warning: the marker names do not stand above every third"));
  const Take gapFirst = withNames(shifted, "1\t0\t\t\t\t4\t5\t6");
  EXPECT_EQ(keys(gapFirst, 1), "1=4 5 6");
}

TEST(TrcHeader, UnitsAndUpAxis) {
  const auto withUnit = [](const std::string& unit, const ReadOptions& options = {}) {
    return read(
        kStart + kNames + "100\t100\t1\t2\t" + unit + "\t100\n" + kTwoMarkers + "1\t0\t1\t2\t3\t4\t5\t6\n",
        options);
  };
  EXPECT_EQ(keys(withUnit("cm"), 0), "1=10 20 30");
  EXPECT_EQ(withUnit("cm").up, Axis::Z);
  EXPECT_EQ(keys(withUnit("m"), 0), "1=1000 2000 3000");
  EXPECT_EQ(withUnit("m").up, Axis::Y);
  EXPECT_THAT(notesOf(withUnit("m").notes), HasSubstr("info: the file names no up axis; y was assumed"));
  EXPECT_EQ(keys(withUnit("m", {.unit = "in"}), 0), "1=25.4 50.8 76.2");
  const Take missing = withUnit("");
  EXPECT_EQ(keys(missing, 0), "1=1 2 3");
  EXPECT_TRUE(missing.unitAssumed);
  EXPECT_EQ(missing.fileUnit, "mm");
  EXPECT_THAT(notesOf(missing.notes),
              HasSubstr("warning: the file names no length unit; millimetres were assumed"));
  EXPECT_THAT(notesOf(withUnit("ell").notes), HasSubstr("the length unit \"ell\" is not known; millimetres"));
  EXPECT_THAT(errorOf([&] { withUnit("mm", {.unit = "ell"}); }), HasSubstr("the unit \"ell\" is not known"));
}

TEST(TrcFrames, NumbersAreTheFileOwn) {
  const Take take = read(kHead + "7\t0.06\t1\t2\t3\n\t0.07\t1\t2\t3\n11\t0.10\t1\t2\t3\n");
  EXPECT_EQ(keys(take, 0), "7=1 2 3  8=1 2 3  11=1 2 3");
  EXPECT_EQ(take.firstFrame, 7);
  EXPECT_EQ(take.frameCount, 5);
  EXPECT_THAT(notesOf(take.notes), HasSubstr("info: 2 frames between the first and the last have no row"));
  EXPECT_THAT(notesOf(take.notes), Not(HasSubstr("Time column")));
  EXPECT_THAT(notesOf(read(kHead + "1\t3.5\t1\t2\t3\n").notes),
              HasSubstr("info: the Time column starts with 3.5 s at frame 1; the frame numbers were taken"));
  EXPECT_THAT(notesOf(read(kHead + "1\t0\t1\t2\t3\n5\t0.08\t1\t2\t3\n").notes),
              HasSubstr("warning: the Time column lasts 0.08 s, the frames at the file's rate 0.04 s"));
}

// Long enough for several runs of keys, with gaps at their borders.
TEST(TrcFrames, LongTakesKeepEveryKey) {
  std::string text = kHead;
  for (int frame = 1; frame <= 2000; ++frame) {
    const std::string number = std::to_string(frame);
    text += number + "\t" + std::to_string((frame - 1) * 0.01) + "\t" +
            (frame % 257 == 0 ? "\t\t" : number + "\t0.5\t-" + number) + "\t1\t1\t" + number + "\n";
  }
  const Take take = read(text);
  EXPECT_EQ(take.points[0].positions.count(), 2000 - 2000 / 257);
  EXPECT_EQ(take.points[1].positions.count(), 2000);
  take.points[0].positions.forEach(0, take.points[0].positions.count(), [&](const KeyTrack::Key& key) {
    ASSERT_EQ(key.values[0], static_cast<double>(key.time / ticksPerFrameAt(100)));
  });
  EXPECT_EQ(placeOf(take.points[1], 1999), Vec3(1, 1, 2000));
}

TEST(TrcErrors, NameLineAndExpectation) {
  const std::pair<std::string, const char*> cases[] = {
      {"PathFile\n", "line 1: PathFileType expected"},
      {kStart,
       "line 2: the line of header names beginning with DataRate expected; the file ends inside its header"},
      {kStart + "Rate\n", "line 2: the header names, DataRate among them, expected, not \"Rate\""},
      {kStart + kNames,
       "line 3: the line of header values (DataRate ...) expected; the file ends inside its header"},
      {kStart + kNames + "fast\t1\n",
       "line 3: a DataRate that is a frame rate from 0.001 to 1000000 a second expected, "
       "not \"fast\""},
      {kStart + kNames + "0\t1\n", "line 3: a DataRate that is"},
      {kStart + kNames + "nan\t1\n", "line 3: a DataRate that is"},
      {kStart + kNames + "100\t1\n",
       "line 4: the line of marker names beginning with Frame# expected; the file ends"},
      {kStart + kNames + "100\t1\n1\t0\t1\n",
       "line 4: the line of marker names beginning with Frame# and Time expected"},
      {kHead, "line 7: a row of data expected; the file ends after its header"},
      {kHead + "one\t0\n", "line 7: a whole frame number expected, not \"one\""},
      {kHead + "1.5\t0\n", "line 7: a whole frame number expected, not \"1.5\""},
      {kHead + "1e10\t0\n", "line 7: a frame number up to 2147483647 expected, not \"1e10\""},
      {kHead + "inf\t0\n", "line 7: a frame number up to"},
      {kHead + "nan\t0\n", "line 7: a whole frame number expected"},
      {kHead + "2\t0\n2\t0\n", "line 8: a frame number after 2 expected, not \"2\""},
      {kHead + "2147483647\t0\n\t0\n", "line 8: the frame numbers run too high"},
      {kHead + "1\tnow\n", "line 7: a time in seconds expected, not \"now\""},
      {kHead + "1\t0\t1\t2\t3\t4\t5,5\t6\n", "line 7: a number expected in column 7, not \"5,5\""},
      {kHead + "1\t0\t1\t2\tinf\n", "line 7: a number expected in column 5, not \"inf\""},
  };
  const TempFolder folder;
  for (const auto& [text, error] : cases) {
    const std::string path = folder.file("bad.trc", text);
    const std::string got = errorOf([&] { readTRC(path); });
    EXPECT_THAT(got, HasSubstr(error)) << text;
    EXPECT_THAT(got, testing::StartsWith(path + ", line "));
  }
  EXPECT_THAT(errorOf([] { readTRC(dataFile("malformed_cut_01.trc")); }),
              HasSubstr("malformed_cut_01.trc, line 3: the line of header values (DataRate ...) expected"));
}

TEST(TrcErrors, DamagedFilesGiveATakeOrAnError) {
  const auto reader = [](const std::string& path) { return readTRC(path); };
  expectSurvivesDamage(readText(dataFile("nan_case_01.trc")), ".trc", 3, 1500, reader);
  expectSurvivesDamage(readText(dataFile("unlabelled_only_01.trc")).substr(0, 12000), ".trc", 101, 300,
                       reader);
}

}  // namespace
}  // namespace talix
