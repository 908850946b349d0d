#include <filesystem>
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "host/services/OperationStack.h"
#include "io/TakeFormats.h"
#include "tests/io/TakeTesting.h"

namespace talix {
namespace {

using testing::HasSubstr;

TEST(TakeFormats, ContentGoesBeforeSuffix) {
  TempFolder const folder;
  std::string const bvh = readText(dataFile("frametime_precise_01.bvh"));
  std::string const trc = readText(dataFile("nan_case_01.trc"));
  EXPECT_EQ(readTake(folder.file("a.trc", bvh)).format, "BVH");
  EXPECT_EQ(readTake(folder.file("b", "\xEF\xBB\xBF\n" + bvh)).format, "BVH");
  EXPECT_EQ(readTake(folder.file("c.bvh", trc)).format, "TRC");
  EXPECT_EQ(readTake(folder.file("d.e.TRC", trc)).name, "d.e");
  EXPECT_EQ(readTake(folder.file("f.bvh", readText(dataFile("single_frame_01.c3d")))).format, "C3D");
}

TEST(TakeFormats, SuffixDecidesWhereContentHasNoMark) {
  TempFolder const folder;
  EXPECT_THAT(errorOf([&] { readTake(folder.file("a.Bvh", "nothing")); }),
              HasSubstr("line 1: HIERARCHY expected"));
  EXPECT_THAT(errorOf([&] { readTake(folder.file("a.trc", "nothing")); }),
              HasSubstr("line 1: PathFileType expected"));
  EXPECT_THAT(errorOf([&] { readTake(folder.file("a.txt", "nothing")); }),
              HasSubstr("a.txt: is no take that can be read (C3D, BVH or TRC)"));
  EXPECT_THAT(errorOf([&] { readTake(folder.file("a.bvh", "")); }), HasSubstr("the file is empty"));
  EXPECT_THAT(errorOf([&] { readTake(folder.path("none.bvh")); }), HasSubstr("there is no such file"));
}

TEST(TakeFormats, WritesBySuffixOnly) {
  TempFolder const folder;
  std::vector<TakeNote> notes;
  Take const take = readTake(dataFile("frametime_precise_01.bvh"));
  EXPECT_THAT(errorOf([&] { writeTake(sourceOf(take), folder.path("a.trc"), notes); }),
              HasSubstr("a.trc: takes are written as"));
  writeTake(sourceOf(take), folder.path("a.bvh"), notes);
  writeTake(sourceOf(readTake(dataFile("nan_case_01.trc"))), folder.path("b.C3D"), notes);
  EXPECT_EQ(readTake(folder.path("b.C3D")).points.size(), 14u);
  EXPECT_EQ(readTake(folder.path("a.bvh")).joints.size(), take.joints.size());
}

// Cancelled on their way, reading and writing end with an error, no task stays, and no file is touched.
TEST(TakeFormats, OpeningAndSavingCanBeCancelled) {
  TempFolder const folder;
  Take take;
  take.frameCount = 20'000;
  take.joints.resize(1);
  take.joints[0].parent = -1;
  for (int i = 0; i < 30; ++i) take.points.emplace_back().positions.set(i, {1, 2, 3});
  std::vector<TakeNote> notes;
  for (char const* name : {"take.c3d", "take.bvh"}) {
    std::string const path = folder.path(name);
    writeTake(sourceOf(take), path, notes);
    std::string const whole = readText(path);
    int shown = 0;
    g_theOperationStack.setDisplay([&](OperationStack::Task const* task) {
      if (!task) return;
      EXPECT_TRUE(task->cancellable);
      if (++shown == 2) g_theOperationStack.cancel();
    });
    EXPECT_THAT(errorOf([&] { readTake(path); }), path + ": cancelled");
    g_theOperationStack.reset();
    shown = 0;
    take.firstFrame = 1;
    EXPECT_THAT(errorOf([&] { writeTake(sourceOf(take), path, notes); }), path + ": cancelled");
    EXPECT_EQ(g_theOperationStack.getNumTasks(), 0);
    g_theOperationStack.setDisplay(nullptr);
    g_theOperationStack.reset();
    EXPECT_EQ(readText(path), whole);
    EXPECT_EQ(std::distance(std::filesystem::directory_iterator(folder.path("")), {}),
              name[5] == 'c' ? 1 : 2);
  }
}

}  // namespace
}  // namespace talix
