// Runs scripts and writes what comes of them: results to one stream, log lines to another, or one JSON object
// a line.
#pragma once

#include <cstdio>
#include <string>
#include <string_view>

#include "session/Session.h"

namespace talix {

// How a run ended; also the program's exit status.
enum class Status { Done = 0, CommandFailed = 1, BadCommandLine = 2, FileFailed = 3, OutOfMemory = 4 };

struct RunStyle {
  bool json = false;
  bool keepGoing = false;   // a failed line does not end the run, unless it left a torn scene
  bool nameLines = false;   // errors name the file and the line: for people at a terminal
  bool flushLines = false;  // what a line prints is written at once: for input that comes line by line
};

class ScriptRunner {
 public:
  ScriptRunner(Session& session, RunStyle const& style, std::FILE* out, std::FILE* err)
      : m_session(session), m_style(style), m_out(out), m_err(err) {}

  // Runs the lines of a text (LF or CRLF ends them). `file` is the name for messages, `firstLine` the number
  // of the first line. False when the run has to end.
  bool runText(std::string_view text, std::string const& file, int firstLine);
  // Runs one line. False when the run has to end.
  bool runLine(std::string_view line, std::string const& file, int number);
  // Runs a line that belongs to no script: only its log lines are written. False when it failed.
  bool runSilently(std::string_view line);

  // The first failure decides, and a torn scene over all.
  Status status() const { return m_status; }
  // Whether a failed line or lost output forbids saving.
  bool mayGoOn() const;
  // Writes what is buffered. False when output was lost.
  bool finish();

 private:
  void report(LineResult const& result, std::string const& file, int number);
  void writeLogLines(LineResult const& result, std::string const& where);

  Session& m_session;
  RunStyle m_style;
  std::FILE* m_out;
  std::FILE* m_err;
  void note(LineResult const& result);

  Status m_status = Status::Done;
  bool m_torn = false;
  std::string m_text;
};

// Whether a line of a script is an "undo" or a "redo".
bool usesUndo(std::string_view script);

// A script's text, without a byte order mark. Throws FileError.
std::string readScript(std::string const& path);

}  // namespace talix
