#include "app/Progress.h"

#include <algorithm>
#include <atomic>
#include <csignal>
#include <cstdio>
#include <iostream>
#include <sys/ioctl.h>
#include <unistd.h>

namespace talix {

namespace {

constexpr auto kRedrawAfter = std::chrono::milliseconds(50);
constexpr int kBarColumns = 20;

// Read by the signal handler.
std::atomic<bool> s_cancellable = false;
static_assert(std::atomic<bool>::is_always_lock_free);

void onInterrupt(int signal) {
  if (s_cancellable && !g_theOperationStack.isCancelled()) return g_theOperationStack.cancel();
  std::signal(signal, SIG_DFL);
  std::raise(signal);
}

// Programs that are started to run on regardless of Ctrl-C keep doing so.
void handleInterrupt(void (*handler)(int)) {
  struct sigaction former {};
  if (::sigaction(SIGINT, nullptr, &former) != 0 || former.sa_handler == SIG_IGN) return;
  struct sigaction action {};
  action.sa_handler = handler;
  action.sa_flags = SA_RESTART;
  ::sigaction(SIGINT, &action, nullptr);
}

size_t terminalColumns() {
  struct winsize size {};
  return ::ioctl(STDERR_FILENO, TIOCGWINSZ, &size) == 0 && size.ws_col > 1 ? size.ws_col : 80u;
}

bool startsCharacter(char c) { return (static_cast<unsigned char>(c) & 0xc0) != 0x80; }

// The first so many characters of a UTF-8 text, control characters made harmless.
std::string clipped(std::string const& text, size_t columns) {
  std::string out;
  for (char const c : text) {
    if (startsCharacter(c) && columns-- == 0) break;
    out += static_cast<unsigned char>(c) < ' ' || c == 0x7f ? '?' : c;
  }
  return out;
}

size_t columnsOf(std::string const& text) {
  return static_cast<size_t>(std::count_if(text.begin(), text.end(), startsCharacter));
}

std::string barOf(OperationStack::Task const& task) {
  double const length = static_cast<double>(task.last) - task.first;
  double const part =
      length > 0 ? std::clamp((static_cast<double>(task.position) - task.first) / length, 0.0, 1.0) : 1;
  auto const done = static_cast<size_t>(part * kBarColumns);
  char percent[16];
  std::snprintf(percent, sizeof percent, "] %3d%%  ", static_cast<int>(part * 100));
  return "[" + std::string(done, '#') + std::string(kBarColumns - done, '-') + percent +
         task.caption.GetString();
}

}  // namespace

Progress::Progress() : m_terminal(::isatty(STDERR_FILENO) != 0) {
  g_theOperationStack.setDisplay([this](OperationStack::Task const* task) { show(task); });
  handleInterrupt(onInterrupt);
}

Progress::~Progress() {
  handleInterrupt(SIG_DFL);
  show(nullptr);
  g_theOperationStack.setDisplay(nullptr);
}

void Progress::show(OperationStack::Task const* task) {
  s_cancellable = task && task->cancellable;
  if (!m_terminal) return;
  if (!task) return draw("");
  // A task says what it does once it has begun.
  if (task->caption.IsEmpty()) return;
  auto const now = std::chrono::steady_clock::now();
  if (m_width > 0 && now - m_drawn < kRedrawAfter) return;
  m_drawn = now;
  draw(clipped(barOf(*task), terminalColumns() - 1));
}

// Over what stands there; plain blanks, so that every terminal will do.
void Progress::draw(std::string const& text) {
  if (m_width == 0 && text.empty()) return;
  size_t const width = columnsOf(text);
  std::string const rest(m_width > width ? m_width - width : 0, ' ');
  std::fprintf(stderr, "\r%s%s%s", text.c_str(), rest.c_str(), text.empty() ? "\r" : "");
  std::fflush(stderr);
  m_width = width;
}

bool canAsk() { return ::isatty(STDIN_FILENO) != 0 && ::isatty(STDERR_FILENO) != 0; }

bool askAtTerminal(std::string const& question) {
  std::fflush(stdout);
  std::fprintf(stderr, "%s [y/N] ", question.c_str());
  std::fflush(stderr);
  std::string answer;
  std::getline(std::cin, answer);
  return answer == "y" || answer == "Y" || answer == "yes" || answer == "Yes" || answer == "YES";
}

}  // namespace talix
