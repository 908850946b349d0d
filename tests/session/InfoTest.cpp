// What "talix info" shows of take files.

#include <boost/json.hpp>
#include <cstdio>
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/wait.h>

namespace {

using testing::HasSubstr;
using testing::Not;

struct Shown {
  std::string text;
  int status;
};

// The files are the tests' takes. Standard error is shown with the output unless it goes elsewhere.
Shown info(std::string const& arguments, std::string const& errors = "2>&1") {
  const std::string command =
      "cd '" TALIX_TEST_DATA "' && '" TALIX_BIN "/talix' info " + arguments + " " + errors;
  Shown shown{"", -1};
  FILE* pipe = ::popen(command.c_str(), "r");
  if (!pipe) return shown;
  char part[4096];
  for (size_t n; (n = std::fread(part, 1, sizeof part, pipe)) > 0;) shown.text.append(part, n);
  shown.status = WEXITSTATUS(::pclose(pipe));
  return shown;
}

TEST(Info, ShowsASkeletonAsATreeWithItsEndsFolded) {
  const Shown shown = info("two_frames_01.bvh");
  EXPECT_THAT(shown.text, HasSubstr("  skeleton: 18 joints, 5 end sites, 57 channels\n"
                                    "    Hips                  Tx Ty Tz Rz Rx Ry\n"
                                    "      Chest               Rz Rx Ry\n"));
  EXPECT_THAT(shown.text, HasSubstr("          Head            Rz Rx Ry            end\n"));
  EXPECT_THAT(shown.text, Not(HasSubstr("Head_end")));
}

TEST(Info, UnlabelledMarkersAreOneLine) {
  EXPECT_THAT(info("unlabelled_only_01.trc").text,
              HasSubstr("    10 unlabelled            6678  75.7   483      540\n"));
}

TEST(Info, AFileThatCannotBeReadDoesNotHideTheOthers) {
  const Shown shown = info("malformed_cut_01.trc nan_case_01.trc");
  EXPECT_EQ(shown.status, 3);
  EXPECT_THAT(shown.text, HasSubstr("error: malformed_cut_01.trc, line 3: "));
  EXPECT_THAT(shown.text, HasSubstr("\nnan_case_01.trc\n  format    TRC\n"));
}

TEST(Info, JsonHoldsTheSame) {
  const Shown shown =
      info("--json nan_case_01.trc mixed_order_01.bvh gait_results_events_01.c3d nothere.c3d", "2>/dev/null");
  EXPECT_EQ(shown.status, 3);
  const boost::json::array files = boost::json::parse(shown.text).as_array();
  ASSERT_EQ(files.size(), 4u);
  const auto& trc = files[0].as_object();
  EXPECT_EQ(trc.at("frames").to_number<int>(), 5);
  int missing = 0;
  for (const auto& marker : trc.at("markers").as_array())
    missing += marker.at("missingFrames").to_number<int>();
  EXPECT_EQ(missing, 5);
  const auto& arm = files[1].at("joints").as_array().at(0);
  EXPECT_EQ(arm.at("rotationOrder").as_string(), "YZX");
  EXPECT_EQ(boost::json::serialize(arm.at("channels")), R"(["Tx","Ty","Tz","Rx","Rz","Ry"])");
  EXPECT_EQ(files[2].at("outputs").as_array().size(), 24u);
  EXPECT_EQ(files[2].at("events").as_array().size(), 6u);
  EXPECT_EQ(files[3].at("error").as_string(), "nothere.c3d: there is no such file");
}

}  // namespace
