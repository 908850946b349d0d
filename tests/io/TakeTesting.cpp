#include "tests/io/TakeTesting.h"

#include <gtest/gtest.h>

#include "io/FileError.h"

namespace talix {

std::string dataFile(std::string const& name) { return std::string(TALIX_TEST_DATA "/") + name; }

std::string errorOf(std::function<void()> const& work) {
  try {
    work();
  } catch (FileError const& error) {
    return error.what();
  }
  return {};
}

std::string notesOf(std::vector<TakeNote> const& notes) {
  std::string text;
  for (TakeNote const& note : notes)
    text += (note.level == TakeNote::Level::Warning ? "warning: " : "info: ") + note.text + "\n";
  return text;
}

void expectSurvivesDamage(std::string const& content, std::string const& suffix, size_t step, int damages,
                          std::function<Take(std::string const& path)> const& read) {
  TempFolder const folder;
  auto const survives = [&](std::string const& damaged) {
    std::string const path = folder.file("damaged" + suffix, damaged);
    try {
      Take const take = read(path);
      for (TakePoint const& point : take.points) {
        ASSERT_STREQ(point.positions.checkInvariants(), "");
        ASSERT_TRUE(point.residuals.empty() || point.residuals.count() == point.positions.count());
        ASSERT_TRUE(point.cameras.empty() || point.cameras.size() == static_cast<size_t>(take.frameCount));
      }
      for (TakeJoint const& joint : take.joints) ASSERT_STREQ(joint.rotations.checkInvariants(), "");
    } catch (FileError const& error) {
      ASSERT_EQ(std::string(error.what()).rfind(path, 0), 0u) << error.what();
    }
  };
  for (size_t length = 0; length < content.size(); length += step) survives(content.substr(0, length));
  std::mt19937 random(20240607);
  for (int i = 0; i < damages; ++i) {
    std::string damaged = content;
    for (unsigned change = random() % 4 + 1; change > 0; --change)
      damaged[random() % damaged.size()] =
          random() % 2 ? static_cast<char>(random() % 256) : "0-9.e{}\t\n\r "[random() % 12];
    survives(damaged);
  }
}

}  // namespace talix
