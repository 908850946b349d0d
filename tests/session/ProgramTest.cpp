// The built program, as its users run it: output, exit statuses, what a failed line stops.

#include <boost/json.hpp>
#include <csignal>
#include <cstdio>
#include <filesystem>
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <pty.h>
#include <sstream>
#include <sys/wait.h>
#include <termios.h>
#include <unistd.h>

#include "tests/TempFolder.h"

namespace {

namespace fs = std::filesystem;
using testing::HasSubstr;

class ProgramTest : public testing::Test {
 protected:
  // Ctrl-C ends programs, and nobody's settings are used, however the tests were started.
  ProgramTest() {
    std::signal(SIGINT, SIG_DFL);
    setenv("TALIX_PROFILE", "", 1);
  }

  // Runs a shell line in the test's folder; "talix" is the program, "$sample" the option for the sample
  // plug-in.
  int run(std::string const& line) {
    std::string const bin = TALIX_BIN;
    std::string const command = "cd '" + m_folder.path("") + "' && talix() { '" + bin +
                                "/talix' \"$@\"; } && sample='--plugin " + bin + "/sample/Sample.so' && { " +
                                line + "\n} >out 2>err";
    int const status = std::system(command.c_str());
    m_out = text("out");
    m_err = text("err");
    return WIFEXITED(status) ? WEXITSTATUS(status) : -1;
  }
  // Runs "talix run" at a terminal without echo and types. What it shows is in m_out, "<" for a carriage
  // return.
  int runAtTerminal(std::vector<std::string> args, std::string const& typed) {
    std::string const bin = TALIX_BIN;
    args.insert(args.begin(), {bin + "/talix", "run", "--plugin", bin + "/sample/Sample.so"});
    std::vector<char*> words;
    for (std::string& arg : args) words.push_back(arg.data());
    words.push_back(nullptr);
    int terminal = -1;
    pid_t const child = forkpty(&terminal, nullptr, nullptr, nullptr);
    if (child == 0) {
      termios quiet{};
      tcgetattr(0, &quiet);
      quiet.c_lflag &= ~static_cast<tcflag_t>(ECHO);
      tcsetattr(0, TCSANOW, &quiet);
      execv(words[0], words.data());
      _exit(127);
    }
    if (child < 0) return -1;
    m_out.clear();
    char chunk[4096];
    bool toType = !typed.empty();
    for (ssize_t size = 0; (size = read(terminal, chunk, sizeof chunk)) > 0;) {
      for (char const c : std::string_view(chunk, static_cast<size_t>(size))) {
        if (c == '\n' && m_out.ends_with('<')) m_out.pop_back();
        m_out += c == '\r' ? '<' : c;
      }
      if (toType) toType = ::write(terminal, typed.data(), typed.size()) < 0;
    }
    close(terminal);
    int status = 0;
    waitpid(child, &status, 0);
    return WIFEXITED(status) ? WEXITSTATUS(status) : -1;
  }
  std::string text(std::string const& file) const { return talix_tests::readText(m_folder.path(file)); }

  talix_tests::TempFolder const m_folder;
  std::string m_out, m_err;
};

TEST_F(ProgramTest, RunsLinesAndScriptsInTheOrderGiven) {
  m_folder.file("two.talix", "\xef\xbb\xbf# two\r\necho 2\r\n\r\necho 3");
  EXPECT_EQ(run("echo 'echo 5' | talix run $sample -c 'echo 1' two.talix -c 'echo 4' - -c 'echo 6'"), 0);
  EXPECT_EQ(m_out, "1\n2\n3\n4\n5\n6\n");
  EXPECT_EQ(m_err, "");
  EXPECT_EQ(run("talix run $sample"), 0);
  EXPECT_EQ(m_out + m_err, "");
}

TEST_F(ProgramTest, AFailedLineStopsTheRunUnlessToldOtherwise) {
  m_folder.file("fails.talix", "echo 1\nfail\necho 2\n");
  EXPECT_EQ(run("talix run $sample fails.talix -c 'echo 3'"), 1);
  EXPECT_EQ(m_out, "1\n");
  EXPECT_EQ(m_err, "info: about to fail\nwarning: 100% sure\nerror: failed\n");
  EXPECT_EQ(run("talix run $sample --keep-going fails.talix -c nothing -c 'echo 3'"), 1);
  EXPECT_EQ(m_out, "1\n2\n3\n");
  EXPECT_THAT(m_err, HasSubstr("error: Unknown command: nothing\n"));
}

TEST_F(ProgramTest, NothingIsSavedAfterAFailedLine) {
  std::string const scene = "--open '" TALIX_TEST_DATA "/pose_t_01.bvh' --save out.bvh ";
  EXPECT_EQ(run("talix run $sample " + scene + "-c nothing"), 1);
  EXPECT_FALSE(fs::exists(m_folder.path("out.bvh")));
  EXPECT_EQ(run("talix run $sample " + scene + "--keep-going -c nothing"), 1);
  EXPECT_TRUE(fs::exists(m_folder.path("out.bvh")));
  fs::remove(m_folder.path("out.bvh"));
  EXPECT_EQ(run("talix run $sample --json " + scene + "-c getTime"), 0) << m_err;
  EXPECT_TRUE(fs::exists(m_folder.path("out.bvh")));
  EXPECT_EQ(std::count(m_out.begin(), m_out.end(), '\n'), 1) << m_out;
}

TEST_F(ProgramTest, FilesThatCannotBeUsedAreStatusThree) {
  EXPECT_EQ(run("talix run $sample --open missing.c3d -c 'echo 1'"), 3);
  EXPECT_EQ(m_out, "");
  EXPECT_THAT(m_err, HasSubstr("error: missing.c3d"));
  EXPECT_EQ(run("talix run $sample -c 'echo 1' missing.talix"), 3);
  EXPECT_EQ(m_out, "");
  EXPECT_THAT(m_err, HasSubstr("error: missing.talix"));
  EXPECT_EQ(run("talix run $sample ."), 3);
  // Where nothing could be saved is told before anything runs.
  for (char const* target : {"nowhere/out.bvh", "out.xyz"}) {
    EXPECT_EQ(run(std::string("talix run $sample -c 'echo 1' --save ") + target), 3);
    EXPECT_EQ(m_out, "");
    EXPECT_THAT(m_err, testing::StartsWith(std::string("error: ") + target));
  }
  EXPECT_EQ(run("talix run $sample -c 'open missing.c3d'"), 3);
  EXPECT_EQ(run("talix run $sample --keep-going -c fail -c 'open missing.c3d'"), 1);
  EXPECT_EQ(run("talix run --plugin missing.so -c 'echo 1'"), 3);
  EXPECT_EQ(m_err, "error: missing.so: no such plug-in library\n");
}

TEST_F(ProgramTest, WrongCommandLinesAreStatusTwo) {
  for (char const* line :
       {"talix", "talix walk", "talix run --nothing", "talix run -c", "talix commands $sample nothing"})
    EXPECT_EQ(run(line), 2) << line;
  EXPECT_EQ(run("talix --help"), 0);
  EXPECT_THAT(m_out, HasSubstr("Examples:"));
  EXPECT_EQ(run("talix run --help"), 0);
  EXPECT_THAT(m_out, HasSubstr("Exit status:"));
  EXPECT_EQ(run("talix --version"), 0);
  EXPECT_THAT(m_out, testing::StartsWith("talix "));
}

TEST_F(ProgramTest, JsonHasOneObjectForEachLineThatIsRun) {
  m_folder.file("some.talix", "# first\necho <1 2.5 3>\n\nfail\nnothing <\n");
  EXPECT_EQ(run("talix run $sample --json --keep-going some.talix -c 'echo \"a\xff\"' -c 'types 1 a' -c "
                "'selection'"),
            1);
  EXPECT_EQ(m_err, "");
  auto const line = [](std::string const& file, int number, std::string const& rest) {
    return boost::json::parse("{\"file\": \"" + file + "\", \"line\": " + std::to_string(number) + ", " +
                              rest + "}");
  };
  std::vector<boost::json::value> const expected = {
      line("some.talix", 2, R"("command": "echo", "ok": true, "result": [1.0, 2.5, 3.0], "log": [])"),
      line("some.talix", 4, R"("command": "fail", "ok": false, "result": null, "log": [
           {"level": "info", "text": "about to fail"}, {"level": "warning", "text": "100% sure"},
           {"level": "error", "text": "failed"}])"),
      line("some.talix", 5, R"("command": "nothing", "ok": false, "result": null, "log": [
           {"level": "error", "text": "Unknown command: nothing"}])"),
      line("-c", 1, "\"command\": \"echo\", \"ok\": true, \"result\": \"a\xef\xbf\xbd\", \"log\": []"),
      line("-c", 2, R"("command": "types", "ok": true, "result": [1, 3], "log": [])"),
      line("-c", 3, R"("command": "selection", "ok": true, "result": [], "log": [])")};
  std::istringstream out(m_out);
  std::vector<boost::json::value> found;
  for (std::string text; std::getline(out, text);) found.push_back(boost::json::parse(text));
  EXPECT_EQ(found, expected);
}

TEST_F(ProgramTest, CommandsAreDescribed) {
  ASSERT_EQ(run("talix commands $sample --json"), 0);
  boost::json::value const all = boost::json::parse(m_out);
  EXPECT_EQ(all.as_array().front().at("name"), "echo");
  EXPECT_EQ(all.as_array().back().at("name"), "help");
  ASSERT_EQ(run("talix commands $sample --json fail"), 0);
  EXPECT_EQ(boost::json::parse(m_out), boost::json::parse(R"([{
      "name": "fail", "displayName": "Fail", "category": "Testing", "subCategory": "", "purpose": "",
      "argsText": "", "example": "", "syntax": null, "options": [
          {"name": "text", "text": "", "args": 0, "type": 0, "mask": 0, "hidden": false},
          {"name": "memory", "text": "runs out of memory", "args": 0, "type": 0, "mask": 0, "hidden": false},
          {"name": "deselect", "text": "", "args": 0, "type": 0, "mask": 0, "hidden": false}],
      "returns": 0, "solo": true, "source": "Sample Commands"}])"));
  ASSERT_EQ(run("talix commands $sample echo"), 0);
  std::string const page = m_out;
  ASSERT_EQ(run("talix run $sample -c 'help echo'"), 0);
  EXPECT_EQ(m_out, page);
  ASSERT_EQ(run("talix commands $sample"), 0);
  EXPECT_THAT(m_out, HasSubstr("\nSystem\n"));
  EXPECT_THAT(m_out, HasSubstr("Moves the current time to a frame"));
}

TEST_F(ProgramTest, LostOutputIsAFailureWithoutACrash) {
  m_folder.file("many.talix", [] {
    std::string lines;
    for (int i = 0; i < 100000; ++i) lines += "echo " + std::to_string(i) + "\n";
    return lines;
  }());
  EXPECT_EQ(run("{ talix run $sample many.talix; echo $? >status; } | head -1"), 0);
  EXPECT_EQ(text("status"), "3\n");
  EXPECT_EQ(m_out, "0\n");
  EXPECT_EQ(m_err, "");
  EXPECT_EQ(run("talix commands $sample >/dev/full"), 3);
  EXPECT_THAT(m_err, HasSubstr("error: standard output: "));
}

TEST_F(ProgramTest, InterruptsCancelATaskOnce) {
  EXPECT_EQ(run("talix run $sample -c 'work a 0' -c 'work b 1' -c 'echo 1'"), 1);
  EXPECT_EQ(m_out + m_err, "");
  EXPECT_EQ(run("talix run $sample --keep-going -c 'work a 1' -c 'work b 1' -c 'work c 0' -c 'echo 1'"), 1);
  EXPECT_EQ(m_out, "1\n");
  // 128 + SIGINT, as the shell tells of programs that it ends; those told to ignore it go on.
  EXPECT_EQ(run("talix run $sample -c 'work a 2' -c 'echo 1'; test $? = 130"), 0);
  EXPECT_EQ(run("trap '' INT; talix run $sample -c 'work a 2' -c 'echo 1'"), 0);
}

// Through a terminal of its own: what it shows, and what is typed at questions.
TEST_F(ProgramTest, TerminalsShowProgressAndAnswerQuestions) {
  ASSERT_EQ(runAtTerminal({"-c", "work \"Fitting\" 0", "-c", "echo done"}, ""), 0) << m_out;
  std::string const bar = "[#####---------------]  25%  Fitting";
  EXPECT_EQ(m_out, "<" + bar + "<" + std::string(bar.size(), ' ') + "<done\n");
  ASSERT_EQ(runAtTerminal({"-c", "ask Sure?", "-c", "ask \"And now?\""}, "y\nno\n"), 0) << m_out;
  EXPECT_THAT(m_out, HasSubstr("Sure? [y/N] 1\nAnd now? [y/N] 0\n"));
  ASSERT_EQ(runAtTerminal({"--yes", "-c", "ask Sure?"}, ""), 0) << m_out;
  EXPECT_EQ(m_out, "1\n");
  EXPECT_EQ(run("talix run $sample -c 'ask Sure?' && talix run --yes $sample -c 'ask Sure?'"), 0);
  EXPECT_EQ(m_out + m_err, "0\n1\n");
}

}  // namespace
