// Long operations at a terminal: a progress bar on standard error, and Ctrl-C.
#pragma once

#include <chrono>
#include <string>

#include "host/services/OperationStack.h"

namespace talix {

// While it lives, the task that is under way is shown on standard error if that is a terminal, and Ctrl-C
// cancels a task that can be cancelled. A second Ctrl-C, or one while there is no such task, ends the program
// as ever. One at a time.
class Progress {
 public:
  Progress();
  ~Progress();
  Progress(Progress const&) = delete;
  Progress& operator=(Progress const&) = delete;

 private:
  void show(OperationStack::Task const* task);
  void draw(std::string const& text);

  bool m_terminal;
  size_t m_width = 0;  // columns drawn on
  std::chrono::steady_clock::time_point m_drawn;
};

// Puts a yes-or-no question to the terminal. Only "y" and "yes" mean yes.
bool askAtTerminal(std::string const& question);
// Whether there is someone to ask: standard input and standard error are terminals.
bool canAsk();

}  // namespace talix
