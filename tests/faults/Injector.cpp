// Makes one allocation or one file call fail: a library to be loaded before all others (LD_PRELOAD).
//
//   TALIX_FAULT=memory:N   the N-th allocation from the start of main() on fails, all others succeed
//   TALIX_FAULT=file:N     the same for calls that open, read, write, sync, name or remove files
//   TALIX_FAULT_COUNT=FILE how many of both kinds there were is written there at the end ("MEMORY FILE")
//
// Programs that look up talixFaultsArm arm it themselves, as often as they like. Glibc only: the functions
// behind the allocator have names of their own there, so that nothing has to be looked up while allocating.
#include <cerrno>
#include <cstdarg>
#include <cstddef>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <dlfcn.h>
#include <fcntl.h>
#include <sys/stat.h>
#include <sys/types.h>
#include <sys/uio.h>
#include <unistd.h>

extern "C" {

void* __libc_malloc(size_t);
void* __libc_calloc(size_t, size_t);
void* __libc_realloc(void*, size_t);
void* __libc_memalign(size_t, size_t);
}

namespace {

enum Kind { kMemory, kFile, kKinds };

thread_local bool s_busy = false;
bool s_armed = false;
long s_count[kKinds];
long s_failing[kKinds];  // 0: none

bool fails(Kind kind) {
  if (!s_armed || s_busy) return false;
  return ++s_count[kind] == s_failing[kind];
}

bool noMemory() {
  if (!fails(kMemory)) return false;
  errno = ENOMEM;
  return true;
}

bool noFile(int error) {
  if (!fails(kFile)) return false;
  errno = error;
  return true;
}

// The function of that name that would have been called.
template <class F>
F* next(char const* name) {
  s_busy = true;
  auto* found = reinterpret_cast<F*>(dlsym(RTLD_NEXT, name));
  s_busy = false;
  return found;
}

}  // namespace

extern "C" {

void talixFaultsArm(long memory, long file) {
  s_count[kMemory] = s_count[kFile] = 0;
  s_failing[kMemory] = memory;
  s_failing[kFile] = file;
  s_armed = true;
}

void talixFaultsDisarm(long* memory, long* file) {
  s_armed = false;
  *memory = s_count[kMemory];
  *file = s_count[kFile];
}

// --- memory ---

void* malloc(size_t size) { return noMemory() ? nullptr : __libc_malloc(size); }
void* calloc(size_t count, size_t size) { return noMemory() ? nullptr : __libc_calloc(count, size); }
void* realloc(void* block, size_t size) { return noMemory() ? nullptr : __libc_realloc(block, size); }
void* memalign(size_t alignment, size_t size) {
  return noMemory() ? nullptr : __libc_memalign(alignment, size);
}
void* aligned_alloc(size_t alignment, size_t size) {
  return noMemory() ? nullptr : __libc_memalign(alignment, size);
}
int posix_memalign(void** block, size_t alignment, size_t size) {
  void* found = noMemory() ? nullptr : __libc_memalign(alignment, size);
  if (!found) return ENOMEM;
  *block = found;
  return 0;
}

// --- files ---

#define FAULTY(result, name, error, parameters, ...)              \
  result name parameters {                                        \
    static auto* const original = next<result parameters>(#name); \
    if (noFile(error)) return result(-1);                         \
    return original(__VA_ARGS__);                                 \
  }

#define FAULTY_OPEN(name)                                                  \
  int name(char const* path, int flags, ...) {                             \
    static auto* const original = next<int(char const*, int, ...)>(#name); \
    va_list rest;                                                          \
    va_start(rest, flags);                                                 \
    auto const mode = va_arg(rest, mode_t);                                \
    va_end(rest);                                                          \
    return noFile(EACCES) ? -1 : original(path, flags, mode);              \
  }
FAULTY_OPEN(open)
FAULTY_OPEN(open64)

#define FAULTY_STREAM(name)                                                     \
  FILE* name(char const* path, char const* mode) {                              \
    static auto* const original = next<FILE*(char const*, char const*)>(#name); \
    return noFile(EACCES) ? nullptr : original(path, mode);                     \
  }
FAULTY_STREAM(fopen)
FAULTY_STREAM(fopen64)

FAULTY(int, mkstemp, EACCES, (char* name), name)
FAULTY(int, mkstemp64, EACCES, (char* name), name)
FAULTY(ssize_t, read, EIO, (int fd, void* to, size_t size), fd, to, size)
FAULTY(ssize_t, pread64, EIO, (int fd, void* to, size_t size, off64_t at), fd, to, size, at)
FAULTY(ssize_t, readv, EIO, (int fd, iovec const* parts, int count), fd, parts, count)
FAULTY(ssize_t, write, ENOSPC, (int fd, void const* from, size_t size), fd, from, size)
FAULTY(ssize_t, pwrite64, ENOSPC, (int fd, void const* from, size_t size, off64_t at), fd, from, size, at)
FAULTY(ssize_t, writev, ENOSPC, (int fd, iovec const* parts, int count), fd, parts, count)
FAULTY(off64_t, lseek64, EIO, (int fd, off64_t to, int whence), fd, to, whence)
FAULTY(int, ftruncate64, EIO, (int fd, off64_t size), fd, size)
FAULTY(int, fsync, EIO, (int fd), fd)
FAULTY(int, fdatasync, EIO, (int fd), fd)
FAULTY(int, fchmod, EPERM, (int fd, mode_t mode), fd, mode)
FAULTY(int, rename, EACCES, (char const* from, char const* to), from, to)
FAULTY(int, link, EACCES, (char const* from, char const* to), from, to)
FAULTY(int, linkat, EACCES, (int at, char const* from, int into, char const* to, int flags), at, from, into,
       to, flags)
FAULTY(int, unlink, EACCES, (char const* path), path)
FAULTY(int, mkdir, EACCES, (char const* path, mode_t mode), path, mode)
FAULTY(int, stat, EACCES, (char const* path, struct stat* status), path, status)
FAULTY(int, stat64, EACCES, (char const* path, struct stat64* status), path, status)
FAULTY(int, fstat, EIO, (int fd, struct stat* status), fd, status)
FAULTY(int, fstat64, EIO, (int fd, struct stat64* status), fd, status)
FAULTY(int, close, EIO, (int fd), fd)

// --- the program's main() ---

using Main = int(int, char**, char**);
static Main* s_main = nullptr;

static void writeCounts() {
  s_armed = false;
  char const* file = getenv("TALIX_FAULT_COUNT");
  if (!file) return;
  if (FILE* out = fopen(file, "w")) {
    fprintf(out, "%ld %ld\n", s_count[kMemory], s_count[kFile]);
    fclose(out);
  }
}

static int armedMain(int argc, char** argv, char** environment) {
  char const* fault = getenv("TALIX_FAULT");
  if (getenv("TALIX_FAULT_COUNT")) atexit(writeCounts);
  if (fault && strncmp(fault, "memory:", 7) == 0) talixFaultsArm(atol(fault + 7), 0);
  if (fault && strncmp(fault, "file:", 5) == 0) talixFaultsArm(0, atol(fault + 5));
  return s_main(argc, argv, environment);
}

int __libc_start_main(Main* main, int argc, char** argv, void (*init)(), void (*fini)(), void (*rtldFini)(),
                      void* stackEnd) {
  s_main = main;
  auto const start =
      next<int(Main*, int, char**, void (*)(), void (*)(), void (*)(), void*)>("__libc_start_main");
  return start(armedMain, argc, argv, init, fini, rtldFini, stackEnd);
}

}  // extern "C"
