// Damaged files: one error that names file and place, or a take; never anything else.
#include <gtest/gtest.h>

#include "io/FileError.h"
#include "io/TakeFormats.h"
#include "tests/io/c3d/C3DTestFiles.h"

namespace talix {
namespace {

class C3DDamage : public testing::Test {
 protected:
  // Reads the bytes as a file; what is read must be sound, an error must name the file. Returns the error.
  std::string outcome(std::string const& bytes) {
    folder.file("damaged.c3d", bytes);
    try {
      Take const take = readC3D(path);
      for (TakePoint const& point : take.points) {
        EXPECT_STREQ(point.positions.checkInvariants(), "");
        EXPECT_TRUE(point.residuals.empty() || point.residuals.count() == point.positions.count());
        EXPECT_TRUE(point.cameras.empty() || point.cameras.size() == static_cast<size_t>(take.frameCount));
      }
      return {};
    } catch (FileError const& error) {
      EXPECT_EQ(std::string(error.what()).find(path), 0u) << error.what();
      return error.what();
    }
  }

  TempFolder const folder;
  std::string const path = folder.path("damaged.c3d");
};

TEST_F(C3DDamage, SaysWhereTheDataEnds) {
  std::string const bytes = readText(dataFile("walkset_a_le_real.c3d"));
  // Frames of 26 points and 16 * 4 samples from block 11 on.
  size_t const frame = (26 * 4 + 64) * 4, data = 10 * 512;
  EXPECT_EQ(
      outcome(bytes.substr(0, data + 300 * frame + 5)),
      path + ", offset " + std::to_string(data + 300 * frame + 5) +
          ": the data section ends at frame 300 of 450 (it starts at offset 5120, a frame takes 672 bytes)");
  EXPECT_EQ(outcome(bytes.substr(0, data + 450 * frame)), "");
  EXPECT_NE(outcome(bytes.substr(0, data + 450 * frame - 1)).find("frame 449 of 450"), std::string::npos);
}

TEST_F(C3DDamage, SaysWhatIsNoC3DFile) {
  EXPECT_NE(outcome("hello").find("is not a C3D file"), std::string::npos);
  EXPECT_NE(outcome(std::string(2000, 'x')).find("is not a C3D file"), std::string::npos);
  std::string bytes = readText(dataFile("single_frame_01.c3d"));
  bytes[512 + 3] = 7;
  EXPECT_NE(outcome(bytes).find("offset 515: is not a C3D file: the processor type is 7"), std::string::npos);
  bytes = readText(dataFile("single_frame_01.c3d"));
  bytes[0] = 1;
  EXPECT_NE(outcome(bytes).find("said to be in block 1"), std::string::npos);
  bytes[0] = 99;
  EXPECT_NE(outcome(bytes).find("the file ends inside the parameter section's header"), std::string::npos);
  EXPECT_NE(errorOf([this] { readC3D(folder.path("none.c3d")); }).find("there is no such file"),
            std::string::npos);
}

TEST_F(C3DDamage, SaysWhereParametersLeadAstray) {
  std::string const bytes = SmallC3D().bytes();
  // The first record is the group POINT: two bytes, the name, then the next-record offset.
  size_t const link = 512 + 4 + 2 + 5;
  std::string damaged = bytes;
  damaged[link] = 2;
  EXPECT_NE(
      outcome(damaged).find("offset 523: parameter POINT: the next-record offset 2 does not lead forward"),
      std::string::npos);
  damaged = bytes;
  damaged[link + 1] = 0x7f;
  EXPECT_NE(outcome(damaged).find("leads beyond the end of the file"), std::string::npos);
  damaged = bytes;
  damaged[damaged.find("USED") + 4 + 2 + 1] = 9;
  EXPECT_NE(outcome(damaged).find("parameter USED has 9 dimensions"), std::string::npos);
}

TEST_F(C3DDamage, GivesATakeOrAnError) {
  SmallC3D small;
  small.channels = 1;
  small.set("ANALOG", integers("USED", {1}));
  small.set("EVENT", integers("USED", {1}));
  small.set("EVENT", C3DParameter{"TIMES", C3DParameter::Type::Real, {2, 1}, {}, {0, 1}});
  auto const reader = [](std::string const& file) { return readC3D(file); };
  expectSurvivesDamage(small.bytes(), ".c3d", 3, 2000, reader);
  expectSurvivesDamage(readText(dataFile("single_frame_01.c3d")), ".c3d", 1, 2000, reader);
  expectSurvivesDamage(readText(dataFile("gait_results_events_01.c3d")).substr(0, 6144 + 448), ".c3d", 101,
                       2000, reader);
}

}  // namespace
}  // namespace talix
