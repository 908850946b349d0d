// Runs the program with one allocation or file call failing, the 1st, then another one, and looks at what it
// leaves: no signal, an exit status that tells, targets that are old or new and whole, no other file, and for
// a lack of memory its one line.
//
//   run_faults TALIX INJECTOR DATA [STRIDE]     every STRIDE-th fault; all of them by default
#include <algorithm>
#include <cstdlib>
#include <cstring>
#include <fcntl.h>
#include <filesystem>
#include <fstream>
#include <map>
#include <set>
#include <sstream>
#include <string>
#include <sys/wait.h>
#include <unistd.h>
#include <vector>

#include "tests/faults/Faults.h"

namespace {

namespace fs = std::filesystem;

struct Case {
  char const* name;
  std::vector<char const*> args;  // DATA stands for the folder of takes
  bool keepsSteps = false;
};

std::vector<Case> cases() {
  return {
      {"edit and save",
       {"run", "--open", "DATA/pose_t_01.bvh", "--save", "out.bvh", "-c", "create Marker m -multiple 5", "-c",
        "select -all", "-c", "getModules", "-c", "select m", "-c", "delete"}},
      {"convert", {"run", "--open", "DATA/walk_hand_01.bvh", "--save", "out.c3d", "--save", "out.bvh"}},
      {"steps",
       {"run", "--open", "DATA/pose_t_01.bvh", "--save", "out.bvh", "--keep-going", "-c", "create Marker m",
        "-c", "create Marker m n o", "-c", "undo", "-c", "redo", "-c", "getModules"},
       true},
      {"information", {"info", "DATA/pose_t_01.bvh"}},
      {"settings", {"run", "-c", "writeProfileInt \"Settings\" \"Speed\" 3"}},
  };
}

std::string contentOf(fs::path const& file) {
  std::ostringstream text;
  text << std::ifstream(file, std::ios::binary).rdbuf();
  return text.str();
}

class Runs {
 public:
  Runs(char** argv, long stride) : m_talix(argv[1]), m_injector(argv[2]), m_data(argv[3]), m_stride(stride) {
    std::string name = (fs::temp_directory_path() / "faults.XXXXXX").string();
    if (!mkdtemp(name.data())) std::abort();
    m_folder = name;
    setenv("TALIX_PROFILE", (m_folder / "work" / kSettings).c_str(), 1);
  }
  ~Runs() { fs::remove_all(m_folder); }
  Runs(Runs const&) = delete;
  Runs& operator=(Runs const&) = delete;

  void tryAll(Case const& which) {
    m_case = &which;
    m_new.clear();
    int const status = run("", true);
    if (status != 0) return m_report.fault("%s: exit status %d without a fault", which.name, status);
    for (auto const& entry : fs::directory_iterator(m_folder / "work"))
      m_new[entry.path().filename()] = contentOf(entry.path());
    long memory = 0, file = 0;
    std::ifstream(m_folder / "count") >> memory >> file;
    if (memory == 0 || file == 0) return m_report.fault("%s: the injector counted nothing", which.name);
    // Every other time the targets are there already.
    for (long n = 1; n <= memory; n += m_stride) tryFault("memory:", n);
    for (long n = 1; n <= file; ++n) tryFault("file:", n);
  }

  int finish() {
    std::printf("%ld runs:", m_runs);
    for (auto const& [status, count] : m_statuses) std::printf(" exit status %d %ld times", status, count);
    std::printf(", %d wrong\n", m_report.faults());
    return m_report.exitStatus();
  }

 private:
  static constexpr char kOld[] = "what stood there before\n";
  static constexpr char kSettings[] = "profile.ini";  // is read as well, so that it is not there before

  void tryFault(char const* kind, long n) {
    bool const memory = *kind == 'm';
    std::string const fault = kind + std::to_string(n);
    int const status = run(fault, n % 2 == 0);
    ++m_runs;
    ++m_statuses[status];
    auto const told = [&](char const* what, std::string const& detail) {
      m_report.fault("%s, %s: %s%s", m_case->name, fault.c_str(), what, detail.c_str());
    };
    std::string const said = contentOf(m_folder / "err");
    if (status < 0) return told("ended by signal ", strsignal(-status));
    if (status == 2 || status > 4 || (status == 4 && !memory)) told("exit status ", std::to_string(status));
    size_t const line = said.find("error: Out of memory\n");
    if (status == 4 && (line == said.npos || said.find("error: ") != line || said.rfind("error: ") != line))
      told("said ", said);
    if (status == 1 && memory && !m_case->keepsSteps) told("a line failed for lack of memory: ", said);
    lookAtFiles(status, n % 2 == 0, told);
  }

  template <class Told>
  void lookAtFiles(int status, bool existed, Told told) {
    std::set<std::string> left;
    for (auto const& entry : fs::directory_iterator(m_folder / "work")) {
      std::string const name = entry.path().filename();
      left.insert(name);
      auto const known = m_new.find(name);
      if (known == m_new.end()) {
        told("left the file ", name);
        continue;
      }
      std::string const content = contentOf(entry.path());
      bool const isOld = existed && content == kOld;
      // What lines of a run with steps were taken back may be missing from the file.
      if (!isOld && content != known->second && !m_case->keepsSteps) told("tore the file ", name);
      if (isOld && status == 0) told("did not write the file ", name);
    }
    for (auto const& [name, content] : m_new)
      if (name == kSettings ? status == 0 && contentOf(m_folder / "err").empty() && !left.contains(name)
                            : (existed || status == 0) && !left.contains(name))
        told("lost the file ", name);
  }

  // The exit status, or minus the signal.
  int run(std::string const& fault, bool withTargets) {
    fs::path const work = m_folder / "work";
    fs::remove_all(work);
    fs::create_directories(work);
    if (withTargets)
      for (auto const& [name, content] : m_new)
        if (name != kSettings) std::ofstream(work / name) << kOld;
    std::vector<std::string> words{m_talix};
    for (std::string word : m_case->args) {
      if (word.starts_with("DATA/")) word.replace(0, 4, m_data);
      words.push_back(word);
    }
    std::vector<char*> argv;
    for (std::string& word : words) argv.push_back(word.data());
    argv.push_back(nullptr);
    std::string const out = m_folder / "out", err = m_folder / "err", count = m_folder / "count";
    pid_t const child = fork();
    if (child == 0) {
      if (chdir(work.c_str()) != 0) _exit(127);
      dup2(open(out.c_str(), O_CREAT | O_TRUNC | O_WRONLY, 0600), 1);
      dup2(open(err.c_str(), O_CREAT | O_TRUNC | O_WRONLY, 0600), 2);
      setenv("LD_PRELOAD", m_injector.c_str(), 1);
      fault.empty() ? setenv("TALIX_FAULT_COUNT", count.c_str(), 1) : setenv("TALIX_FAULT", fault.c_str(), 1);
      if (fault.empty()) setenv("TALIX_FAULT", "memory:0", 1);
      execv(argv[0], argv.data());
      _exit(127);
    }
    int status = 0;
    waitpid(child, &status, 0);
    return WIFEXITED(status) ? WEXITSTATUS(status) : -WTERMSIG(status);
  }

  std::string m_talix, m_injector, m_data;
  long m_stride, m_runs = 0;
  fs::path m_folder;
  Case const* m_case = nullptr;
  std::map<std::string, std::string> m_new;  // what a run without a fault leaves
  std::map<int, long> m_statuses;
  faults::Report m_report;
};

}  // namespace

int main(int argc, char** argv) {
  if (argc < 4) {
    std::printf("usage: run_faults TALIX INJECTOR DATA [STRIDE]\n");
    return 2;
  }
  Runs runs(argv, argc > 4 ? std::max(1L, std::atol(argv[4])) : 1);
  for (Case const& which : cases()) runs.tryAll(which);
  return runs.finish();
}
