// Settings and their file.
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <thread>

#include "host/base/Log.h"
#include "host/services/HInterface.h"
#include "tests/TempFolder.h"

namespace {

class ProfileTest : public testing::Test, private LogSink {
 protected:
  ProfileTest() : m_former(setLogSink(this)) {}
  ~ProfileTest() override { setLogSink(m_former); }

  std::string file(std::string const& name) const { return m_folder.path(name); }
  std::string contentOf(std::string const& name) const { return talix_tests::readText(file(name)); }
  void put(std::string const& name, std::string const& content) { m_folder.file(name, content); }

  std::string m_log;

 private:
  void write(LogLevel, std::string_view text) override { m_log += std::string(text) + "\n"; }

  talix_tests::TempFolder const m_folder;
  LogSink* m_former;
};

TEST_F(ProfileTest, IsKeptInItsFileBesideWhatOthersWrite) {
  HInterface one, other;
  std::string const path = file("new/folder/profile.ini");
  EXPECT_TRUE(one.loadProfile(path));
  EXPECT_TRUE(other.loadProfile(path));
  EXPECT_TRUE(one.writeProfileDouble("Reduction", "LengthMM", 0.25));
  EXPECT_TRUE(other.writeProfileBool("Demo", "on", true));
  EXPECT_EQ(contentOf("new/folder/profile.ini"), "[Reduction]\nLengthMM=0.25\n\n[Demo]\non=true\n");

  HInterface later;
  EXPECT_TRUE(later.loadProfile(path));
  EXPECT_EQ(later.getProfile(profile::kReductionLength), 0.25);
  EXPECT_TRUE(later.getProfileBool("Demo", "on", false));
  EXPECT_EQ(m_log, "");
}

// Comments and order stay, also those at the ends, and writing again changes no more.
TEST_F(ProfileTest, WhatItDoesNotSetStaysAsItWas) {
  put("own.ini", "; whose\n\n[B]\n# of x\nx=1\n\n; of y\ny = 2 ; two\n[A]\nz=3\n\n; the end\n");
  HInterface face;
  EXPECT_TRUE(face.writeProfileInt("A", "w", 4, file("own.ini")));
  std::string const once = contentOf("own.ini");
  EXPECT_EQ(once, "; whose\n\n[B]\n\n# of x\nx=1\n\n; of y\ny=2 ; two\n\n[A]\nz=3\nw=4\n\n; the end\n");
  EXPECT_TRUE(face.writeProfileInt("A", "w", 5, file("own.ini")));
  EXPECT_TRUE(face.writeProfileInt("A", "w", 4, file("own.ini")));
  EXPECT_EQ(contentOf("own.ini"), once);
  EXPECT_EQ(m_log, "");
}

TEST_F(ProfileTest, SeveralWritersLoseNothing) {
  std::vector<std::thread> writers;
  for (int w = 0; w < 4; ++w)
    writers.emplace_back([&, w] {
      HInterface face;
      for (int i = 0; i < 25; ++i)
        face.writeProfileInt("Demo", ("n" + std::to_string(25 * w + i)).c_str(), i, file("shared.ini"));
    });
  for (std::thread& writer : writers) writer.join();
  HInterface face;
  for (int i = 0; i < 100; ++i)
    EXPECT_EQ(face.getProfileInt("Demo", ("n" + std::to_string(i)).c_str(), -1, file("shared.ini")), i % 25);
}

TEST_F(ProfileTest, ABrokenFileIsToldAndLeftAlone) {
  put("broken.ini", "[Undo]\nMemoryMB=5\nwhat\n");
  HInterface face;
  EXPECT_FALSE(face.loadProfile(file("broken.ini")));
  EXPECT_THAT(m_log, testing::StartsWith(file("broken.ini") + ", line 3: "));
  EXPECT_EQ(face.getProfile(profile::kUndoMemory), 1024);
  EXPECT_TRUE(face.writeProfileInt("Undo", "MemoryMB", 6));
  EXPECT_EQ(face.getProfile(profile::kUndoMemory), 6);
  EXPECT_EQ(contentOf("broken.ini"), "[Undo]\nMemoryMB=5\nwhat\n");
}

TEST_F(ProfileTest, AValueThatCannotBeWrittenStillCounts) {
  put("a file", "");
  HInterface face;
  EXPECT_TRUE(face.loadProfile(file("a file/profile.ini")));
  EXPECT_FALSE(face.writeProfileInt("Demo", "n", 3));
  EXPECT_THAT(m_log, testing::HasSubstr("a file/profile.ini: cannot be written: "));
  EXPECT_EQ(face.getProfileInt("Demo", "n", 0), 3);
}

TEST_F(ProfileTest, KnownValuesAreNumbersNotBelowTheirLeast) {
  HInterface face;
  for (char const* bad : {"-0.1", "abc", "", "nan", "1e999", "0.1mm"}) {
    m_log.clear();
    EXPECT_TRUE(face.writeProfileString("Reduction", "LengthMM", bad));
    EXPECT_EQ(face.getProfile(profile::kReductionLength), 0.1) << bad;
    EXPECT_EQ(m_log, "Profile value Reduction LengthMM is \"" + std::string(bad) +
                         "\", not a number of at least 0; 0.1 is used\n");
  }
  EXPECT_TRUE(face.writeProfileString("Reduction", "LengthMM", "0"));
  EXPECT_EQ(face.getProfile(profile::kReductionLength), 0);
}

}  // namespace
