// The ways in which files store the same thing. What real takes hold stands in the listing of all takes.
#include <gtest/gtest.h>

#include "io/FileError.h"
#include "io/TakeFormats.h"
#include "tests/io/c3d/C3DTestFiles.h"

namespace talix {
namespace {

TEST(C3DReader, LoadsAllNumberFormsOfOneTrialAlike) {
  Take const first = readC3D(dataFile("walkset_a_le_int.c3d"));
  for (char const* other : {"walkset_a_be_int", "walkset_a_vax_int", "walkset_a_layout_padafter"})
    EXPECT_EQ(differenceOf(first, readC3D(dataFile(std::string(other) + ".c3d")), 1e-12), "");
  Take const real = readC3D(dataFile("walkset_a_le_real.c3d"));
  for (char const* other : {"walkset_a_be_real", "walkset_a_vax_real"})
    EXPECT_EQ(differenceOf(real, readC3D(dataFile(std::string(other) + ".c3d")), 1e-12), "");
  // A coordinate's step is 1/12 mm in the integer files.
  EXPECT_EQ(differenceOf(first, real, 0.09), "");
}

TEST(C3DReader, ConvertsLengthsToMillimetres) {
  std::string const file = dataFile("push_nan_01.c3d");
  Take const take = readC3D(file), asFeet = readC3D(file, {"ft"}), asMillimetres = readC3D(file, {"mm"});
  EXPECT_EQ(take.unitInMillimetres, 1000);
  EXPECT_TRUE(hasNote(take.notes, TakeNote::Level::Info, "6384 point-frames hold no numbers"));
  EXPECT_TRUE(hasNote(asFeet.notes, TakeNote::Level::Info, "read as ft"));
  for (size_t i = 0; i < take.points.size(); ++i) {
    if (take.points[i].positions.empty()) continue;
    double const x = asMillimetres.points[i].positions.at(0).values[0];
    EXPECT_NEAR(take.points[i].positions.at(0).values[0], 1000 * x, 1e-9);
    EXPECT_NEAR(asFeet.points[i].positions.at(0).values[0], 304.8 * x, 1e-9);
  }
  EXPECT_THROW(readC3D(file, {"furlong"}), FileError);
  EXPECT_EQ(millimetresPerUnit(" Meters"), 1000);
  EXPECT_EQ(millimetresPerUnit("inches"), 25.4);
  EXPECT_EQ(millimetresPerUnit("Feet"), 304.8);
  EXPECT_EQ(millimetresPerUnit("furlong"), 0);
}

}  // namespace
}  // namespace talix
