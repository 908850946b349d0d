// Runs the lines of a scenario, one after the other, in a session that keeps steps. Before a line runs it is
// tried in copies of the process, in each of which another of its allocations or file calls fails. Then the
// scene must be as before the line (or as after it, where the fault could be borne), with the same steps, and
// the line must run and be undone as ever; or the program ended in the one way that is allowed.
//
//   line_faults PLUGIN SCENARIO [STRIDE]     every STRIDE-th fault of a line; all of them by default
#include <cstdlib>
#include <cstring>
#include <dlfcn.h>
#include <fstream>
#include <string>
#include <sys/mman.h>
#include <sys/wait.h>
#include <unistd.h>

#include "host/base/OutOfMemory.h"
#include "session/Session.h"
#include "tests/SceneText.h"
#include "tests/faults/Faults.h"

namespace {

using talix::LineResult;
using talix::Session;
using talix_tests::firstDifference;
using talix_tests::SceneText;

// What a copy of the process tells.
struct Shared {
  long memory, file;  // how often each was asked for
  int outcome;
  size_t size;
  char text[64 << 20];
};

struct Fault {
  long memory, file;  // the failing one, 0: none
};

enum Exit { kSame = 0, kWrong = 1, kTakenBack = 2, kEnded = 4 };

class Trials {
 public:
  Trials(std::string const& plugin, long stride) : m_session(plugin), m_stride(stride) {
    m_arm = reinterpret_cast<faults::Arm*>(dlsym(RTLD_DEFAULT, faults::kArm));
    m_disarm = reinterpret_cast<faults::Disarm*>(dlsym(RTLD_DEFAULT, faults::kDisarm));
    void* shared = mmap(nullptr, sizeof(Shared), PROT_READ | PROT_WRITE, MAP_SHARED | MAP_ANONYMOUS, -1, 0);
    m_shared = shared == MAP_FAILED ? nullptr : static_cast<Shared*>(shared);
    m_session.setUndo(true);
  }
  bool isReady() const { return m_arm && m_disarm && m_shared; }

  void run(std::string const& line) {
    m_before = SceneText().write();
    m_steps = g_db->getUndoJournal().getNumUndoSteps();
    if (inCopy(line, {}) != kSame) return m_report.fault("%s: does not run by itself", line.c_str());
    m_after.assign(m_shared->text, m_shared->size);
    m_outcome = m_shared->outcome;
    long const memory = m_shared->memory, file = m_shared->file;
    // The first fault differs from line to line, so that many places are met whatever the stride.
    for (long n = 1 + m_lines % m_stride; n <= memory; n += m_stride) tryFault(line, {n, 0});
    for (long n = 1 + m_lines % m_stride; n <= file; n += m_stride) tryFault(line, {0, n});
    ++m_lines;
    m_session.run(line);
  }

  int finish() {
    std::printf("%ld faults in %ld lines: %ld taken back, %ld borne, %ld ended the program, %d wrong\n",
                m_counts[kSame] + m_counts[kTakenBack] + m_counts[kEnded] + m_counts[kWrong], m_lines,
                m_counts[kTakenBack], m_counts[kSame], m_counts[kEnded], m_report.faults());
    if (m_counts[kTakenBack] == 0) m_report.fault("nothing was taken back: is the injector loaded?");
    return m_report.exitStatus();
  }

 private:
  void tryFault(std::string const& line, Fault fault) {
    int const status = inCopy(line, fault);
    auto const told = [&](char const* what, char const* detail) {
      m_report.fault("%s, %s %ld: %s%s", line.c_str(), fault.memory ? "allocation" : "file call",
                     fault.memory + fault.file, what, detail);
    };
    ++m_counts[status == kSame || status == kTakenBack || status == kEnded ? status : kWrong];
    if (status < 0) return told("ended by signal ", strsignal(-status));
    if (status == kWrong) return told("", m_shared->text);
    if (status != kSame && status != kTakenBack && status != kEnded) told("exit status is not 4", "");
  }

  // The exit status of a copy that runs the line with a fault; minus the signal that ended it.
  int inCopy(std::string const& line, Fault fault) {
    std::fflush(stdout);
    pid_t const child = fork();
    if (child == 0) _exit(tried(line, fault));
    int status = 0;
    waitpid(child, &status, 0);
    return WIFEXITED(status) ? WEXITSTATUS(status) : -WTERMSIG(status);
  }

  int tried(std::string const& line, Fault fault) {
    endProgramWhenOutOfMemory();
    m_arm(fault.memory, fault.file);
    LineResult const& result = m_session.run(line);
    m_disarm(&m_shared->memory, &m_shared->file);
    m_shared->outcome = static_cast<int>(result.outcome);
    bool const lacked = result.outcome == LineResult::Outcome::OutOfMemory;
    if (result.torn) return kEnded;  // whoever runs the lines ends then
    std::string const text = SceneText().write();
    if (fault.memory == 0 && fault.file == 0) {
      tell(text);
      return kSame;
    }
    if (!lacked && m_shared->outcome == m_outcome) {
      std::string const difference = firstDifference(m_after, text);
      return difference.empty() ? kSame : wrong("goes on otherwise:\n" + difference);
    }
    if (!result.failed()) return wrong("succeeds without a reason");
    return isAsBefore(text, line);
  }

  int isAsBefore(std::string const& text, std::string const& line) {
    if (std::string const difference = firstDifference(m_before, text); !difference.empty())
      return wrong("is not taken back:\n" + difference);
    UndoJournal& journal = g_db->getUndoJournal();
    if (journal.getNumUndoSteps() != m_steps) return wrong("the steps are not as before");
    if (static_cast<int>(m_session.run(line).outcome) != m_outcome) return wrong("does not run afterwards");
    HString name;
    bool const isStep = journal.getNumUndoSteps() == m_steps + 1 && journal.getNumRedoSteps() == 0;
    if (isStep) journal.undo(name);
    std::string const difference = isStep ? firstDifference(m_before, SceneText().write()) : "";
    return difference.empty() ? kTakenBack : wrong("cannot be undone afterwards:\n" + difference);
  }

  int wrong(std::string const& what) {
    tell(what);
    return kWrong;
  }
  void tell(std::string const& text) {
    m_shared->size = std::min(text.size(), sizeof m_shared->text - 1);
    std::memcpy(m_shared->text, text.data(), m_shared->size);
    m_shared->text[m_shared->size] = 0;
  }

  Session m_session;
  long m_stride, m_lines = 0;
  long m_counts[5] = {};
  faults::Arm* m_arm;
  faults::Disarm* m_disarm;
  Shared* m_shared;
  faults::Report m_report;
  std::string m_before, m_after;
  int m_steps = 0, m_outcome = 0;
};

}  // namespace

int main(int argc, char** argv) {
  if (argc < 3) {
    std::printf("usage: line_faults PLUGIN SCENARIO [STRIDE]\n");
    return 2;
  }
  Trials trials(argv[1], argc > 3 ? std::max(1L, std::atol(argv[3])) : 1);
  if (!trials.isReady()) {
    std::printf("the injector is not loaded: set LD_PRELOAD\n");
    return 2;
  }
  std::ifstream scenario(argv[2]);
  for (std::string line; std::getline(scenario, line);)
    if (!line.empty() && line.front() != '#') trials.run(line);
  return trials.finish();
}
