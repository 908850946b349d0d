// What becomes of the files of a transcoded video.
#include <filesystem>
#include <gmock/gmock.h>

#include "tests/TempFolder.h"
#include "tests/plugin/SceneFixture.h"

namespace {

using talix_tests::readText;
using testing::HasSubstr;

class VideoCommands : public SceneFixture {
 protected:
  std::string transcode(std::string const& from, std::string const& to, std::vector<GivenOption> options) {
    options.push_back({"videoPayload", {"mpeg4"}});
    return run("transcodeVideo", {from.c_str(), to.c_str()}, options);
  }

  talix_tests::TempFolder folder;
};

TEST_F(VideoCommands, KeepTheOriginalBesideTheSource) {
  std::string const original = readText(TALIX_TEST_DATA "/person_01.mp4");
  std::string const path = folder.file("take.one.mp4", original);
  std::string const backup = folder.file("take_Original.one.mp4", "an older one");
  EXPECT_EQ(transcode(path, path, {{"backupOriginalFile"}, {"quality", {1}}}), "nothing");
  EXPECT_EQ(readText(backup), original);
  EXPECT_NE(readText(path), original);

  // What is not there has no backup, which is what cannot be read then.
  EXPECT_THAT(transcode(folder.path("none.mp4"), folder.path("to.mp4"), {{"backupOriginalFile"}}),
              HasSubstr("none_Original.mp4: No such file or directory\nfailed"));
  // A copy that is no video: the source stays.
  std::string const text = folder.file("text.mp4", "words");
  EXPECT_THAT(transcode(text, text, {{"backupOriginalFile"}}), HasSubstr("text_Original.mp4: not a video"));
  EXPECT_EQ(readText(text), "words");
}

}  // namespace
