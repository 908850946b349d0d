#include "host/base/OutOfMemory.h"

#include <atomic>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <new>
#include <unistd.h>

#include "host/base/ThreadLocal.h"

namespace {

constexpr int kExitStatus = 4;
// Large enough that the system takes it back when it is freed and can use it for anything.
constexpr size_t kReserve = size_t{1} << 20;

TALIX_THREAD_LOCAL int t_throwing = 0;
TALIX_THREAD_LOCAL MemoryReserve* t_mustFinish = nullptr;
std::atomic<bool> s_ends = false;

void onFailure() {
  if (t_mustFinish && t_mustFinish->release()) return;  // try again
  if (!t_mustFinish && (t_throwing > 0 || !s_ends)) throw std::bad_alloc();
  endForLackOfMemory();
}

// Installed once, with the engine: whoever puts another handler in place has his reasons.
std::new_handler const s_former = std::set_new_handler(onFailure);

}  // namespace

void endProgramWhenOutOfMemory() { s_ends = true; }

void endForLackOfMemory() {
  std::fflush(stdout);
  static constexpr char text[] = "error: Out of memory\n";
  ssize_t const written = ::write(STDERR_FILENO, text, sizeof text - 1);
  static_cast<void>(written);  // there is nobody else to tell
  ::_exit(kExitStatus);
}

ThrowsBadAlloc::ThrowsBadAlloc(bool throws) : m_throws(throws) {
  if (m_throws) ++t_throwing;
}

ThrowsBadAlloc::~ThrowsBadAlloc() {
  if (m_throws) --t_throwing;
}

bool MemoryReserve::fill() {
  if (!m_block) m_block = std::malloc(kReserve);
  return m_block != nullptr;
}

bool MemoryReserve::release() {
  bool const had = m_block != nullptr;
  std::free(m_block);
  m_block = nullptr;
  return had;
}

MustFinish::MustFinish(MemoryReserve& reserve) : m_former(t_mustFinish) { t_mustFinish = &reserve; }

MustFinish::~MustFinish() { t_mustFinish = m_former; }
