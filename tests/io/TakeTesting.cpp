#include "tests/io/TakeTesting.h"

#include <gtest/gtest.h>

#include "io/FileError.h"

namespace talix {

std::string dataFile(const std::string& name) { return std::string(TALIX_TEST_DATA "/") + name; }

std::string errorOf(const std::function<void()>& work) {
  try {
    work();
  } catch (const FileError& error) {
    return error.what();
  }
  return {};
}

std::string notesOf(const std::vector<TakeNote>& notes) {
  std::string text;
  for (const TakeNote& note : notes)
    text += (note.level == TakeNote::Level::Warning ? "warning: " : "info: ") + note.text + "\n";
  return text;
}

void expectSurvivesDamage(const std::string& content, const std::string& suffix, size_t step, int damages,
                          const std::function<Take(const std::string& path)>& read) {
  const TempFolder folder;
  const auto survives = [&](const std::string& damaged) {
    const std::string path = folder.file("damaged" + suffix, damaged);
    try {
      const Take take = read(path);
      for (const TakePoint& point : take.points) {
        ASSERT_STREQ(point.positions.checkInvariants(), "");
        ASSERT_TRUE(point.residuals.empty() || point.residuals.count() == point.positions.count());
        ASSERT_TRUE(point.cameras.empty() || point.cameras.size() == static_cast<size_t>(take.frameCount));
      }
      for (const TakeJoint& joint : take.joints) ASSERT_STREQ(joint.rotations.checkInvariants(), "");
    } catch (const FileError& error) {
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
