// Checks transcripts: files that read as a session with the program.
//
//   # a comment; it and blank lines are kept
//   > echo [a b]
//   [a b]
//   > echo -int x
//   error: Option -int of echo needs 1 integer
//   failed
//   # take: data/walk.c3d -up z
//
// Lines after "> " are run in order against a fresh scene; the lines below each are what must be printed: log
// lines, the result, and "failed" when the command failed. A printed line that is empty or begins with "#",
// ">" or "|" stands after "| ". A take is opened without showing what "open" says of it. The working folder
// is the folder of the tests. In the end every line is undone and redone, and the scene compared with what it
// was.
//
//   transcripts [--update] [--dev] --plugin LIBRARY FILE...
// --update rewrites the files instead; --dev has the commands for developers

#include <cstdio>
#include <filesystem>
#include <fstream>
#include <iostream>
#include <string>
#include <vector>

#include "session/ScriptText.h"
#include "session/Session.h"
#include "tests/SceneText.h"

namespace {

using talix_tests::firstDifference;
using talix_tests::SceneText;
using Lines = std::vector<std::string>;

constexpr std::string_view kPrompt = "> ", kTake = "# take: ";

Lines splitLines(std::string_view text) {
  Lines lines;
  while (!text.empty()) {
    size_t const end = text.find('\n');
    lines.emplace_back(text.substr(0, end));
    text.remove_prefix(end == std::string_view::npos ? text.size() : end + 1);
  }
  return lines;
}

void addPrinted(std::string_view text, Lines& lines) {
  Lines printed = splitLines(text);
  if (printed.empty()) printed.emplace_back();
  for (std::string const& line : printed) {
    bool const plain = !line.empty() && std::string_view("#>|").find(line.front()) == std::string_view::npos;
    lines.push_back(plain ? line : line.empty() ? "|" : "| " + line);
  }
}

void addResult(talix::LineResult const& result, Lines& lines) {
  for (talix::LogLine const& line : result.log)
    addPrinted(getLogLevelName(line.level) + (": " + line.text), lines);
  if (result.value.getType() != Variable::None) addPrinted(talix::toText(result.value), lines);
  if (result.failed()) lines.emplace_back("failed");
}

// What the scene was after each step: undo and redo have to bring it back, and a line that leaves no step
// must have changed nothing.
class UndoCheck {
 public:
  UndoCheck() : m_states{SceneText().write()} {}

  void lineDone(std::string const& line) {
    auto const steps = static_cast<size_t>(m_journal.getNumUndoSteps());
    bool const fresh = steps == m_steps + 1 && m_journal.getNumRedoSteps() == 0 && !line.starts_with("redo");
    if (line.starts_with("newScene")) m_states.clear();
    if (fresh || m_states.empty()) {
      m_states.resize(steps);
      m_states.push_back(SceneText().write());
    } else {
      compare(steps, line);
    }
    m_steps = steps;
  }
  // Undoes and redoes everything.
  void finish() {
    HString step;
    while (m_journal.undo(step)) compare(static_cast<size_t>(m_journal.getNumUndoSteps()), "undo");
    while (m_journal.redo(step)) compare(static_cast<size_t>(m_journal.getNumUndoSteps()), "redo");
  }

 private:
  void compare(size_t steps, std::string const& line) const {
    std::string const difference = firstDifference(m_states.at(steps), SceneText().write());
    if (!difference.empty())
      throw std::runtime_error("after " + std::to_string(steps) + " steps, line " + line + ":\n  " +
                               difference);
  }

  UndoJournal& m_journal = g_db->getUndoJournal();
  std::vector<std::string> m_states;  // by number of steps
  size_t m_steps = 0;
};

// The file as it ought to be.
Lines replayed(Lines const& file, std::string const& plugin) {
  talix::Session session(plugin);
  session.run("newScene");
  session.setUndo(true);
  UndoCheck check;
  Lines lines;
  for (std::string const& line : file) {
    if (line.starts_with(kPrompt)) {
      lines.push_back(line);
      addResult(session.run(std::string_view(line).substr(kPrompt.size())), lines);
      check.lineDone(line.substr(kPrompt.size()));
    } else if (line.starts_with(kTake)) {
      lines.push_back(line);
      std::string const open = "open " + line.substr(kTake.size());
      if (talix::LineResult const& result = session.run(open); result.failed()) addResult(result, lines);
      check.lineDone(open);
    } else if (line.empty() || line.front() == '#') {
      lines.push_back(line);
    }
  }
  check.finish();
  return lines;
}

// The prompt lines are the same in both, so the first line that differs lies below one of them.
void tellDifference(std::string const& path, Lines const& expected, Lines const& found) {
  size_t i = 0;
  while (i < expected.size() && i < found.size() && expected[i] == found[i]) ++i;
  size_t prompt = i;
  while (prompt > 0 && !expected[--prompt].starts_with(kPrompt)) continue;
  auto const lineOr = [](Lines const& lines, size_t at) {
    return at < lines.size() ? lines[at] : "(the end)";
  };
  std::cout << path << ":" << i + 1 << ": after \"" << expected[prompt]
            << "\"\n  expected: " << lineOr(expected, i) << "\n  printed:  " << lineOr(found, i) << "\n";
}

Lines readFile(std::string const& path) {
  std::ifstream file(path, std::ios::binary);
  if (!file) throw std::runtime_error(path + ": cannot be opened");
  std::string const text(std::istreambuf_iterator<char>(file), {});
  return splitLines(text);
}

void writeFile(std::string const& path, Lines const& lines) {
  std::ofstream file(path, std::ios::binary);
  for (std::string const& line : lines) file << line << "\n";
  if (!file.flush()) throw std::runtime_error(path + ": cannot be written");
}

}  // namespace

int main(int argc, char** argv) {
  bool update = false, same = true;
  std::string plugin, current;
  std::vector<std::string> paths;
  for (int i = 1; i < argc; ++i) {
    std::string const arg = argv[i];
    if (arg == "--update") {
      update = true;
    } else if (arg == "--dev") {
      Database::setDevOnlyMode(true);
    } else if (arg == "--plugin" && i + 1 < argc) {
      plugin = std::filesystem::absolute(argv[++i]);
    } else {
      paths.push_back(std::filesystem::absolute(arg));
    }
  }
  if (paths.empty()) {
    std::cout << "usage: transcripts [--update] [--dev] --plugin LIBRARY FILE...\n";
    return 2;
  }
  try {
    std::filesystem::current_path(TALIX_TESTS_FOLDER);
    for (std::string const& path : paths) {
      current = path;
      Lines const expected = readFile(path);
      Lines const found = replayed(expected, plugin);
      if (found == expected) continue;
      if (update) {
        writeFile(path, found);
      } else {
        tellDifference(path, expected, found);
        same = false;
      }
    }
  } catch (std::exception const& error) {
    std::cout << current << ": " << error.what() << "\n";
    return 2;
  }
  return same ? 0 : 1;
}
