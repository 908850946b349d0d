#include "host/base/ReplaceFile.h"

#include <array>
#include <cerrno>
#include <climits>
#include <cstdlib>
#include <fcntl.h>
#include <streambuf>
#include <sys/stat.h>
#include <system_error>
#include <unistd.h>

namespace {

[[noreturn]] void fail(int error = errno) { throw std::system_error(error, std::generic_category()); }

// Closes the file at the end of a scope.
struct Descriptor {
  int fd;
  ~Descriptor() {
    if (fd >= 0) ::close(fd);
  }
};

// Writes to a descriptor and remembers why that failed.
class DescriptorBuffer : public std::streambuf {
 public:
  explicit DescriptorBuffer(int fd) : m_fd(fd) { setp(m_buffer.data(), m_buffer.data() + m_buffer.size()); }
  int error() const { return m_error; }

 protected:
  int_type overflow(int_type c) override {
    if (!flush()) return traits_type::eof();
    return traits_type::eq_int_type(c, traits_type::eof()) ? traits_type::not_eof(c)
                                                           : sputc(traits_type::to_char_type(c));
  }
  int sync() override { return flush() ? 0 : -1; }

 private:
  bool flush() {
    char const* from = pbase();
    while (from < pptr()) {
      ssize_t const written = ::write(m_fd, from, static_cast<size_t>(pptr() - from));
      if (written < 0 && errno == EINTR) continue;
      if (written < 0) {
        m_error = errno;
        return false;
      }
      from += written;
    }
    setp(m_buffer.data(), m_buffer.data() + m_buffer.size());
    return true;
  }

  int m_fd;
  int m_error = 0;
  std::array<char, 1 << 16> m_buffer;
};

// The file that a chain of links leads to; the path itself when it is no link, or leads to nothing.
std::string targetOf(std::string const& path) {
  struct stat status {};
  if (::lstat(path.c_str(), &status) != 0 || !S_ISLNK(status.st_mode)) return path;
  char* found = ::realpath(path.c_str(), nullptr);
  if (!found) return path;
  std::string target = found;
  std::free(found);
  return target;
}

std::string folderOf(std::string const& path) {
  size_t const slash = path.rfind('/');
  return slash == std::string::npos ? "." : slash == 0 ? "/" : path.substr(0, slash);
}

// A file of no name, or, where the file system has none such, of a temporary one.
struct Fresh : Descriptor {
  explicit Fresh(std::string const& place) : Descriptor{-1}, folder(place) {
    fd = ::open(place.c_str(), O_TMPFILE | O_WRONLY | O_CLOEXEC, 0666);
    if (fd >= 0) return;
    if (errno != EOPNOTSUPP && errno != EISDIR && errno != ENOENT) fail();
    fd = named([](char const* free) { return ::open(free, O_CREAT | O_EXCL | O_WRONLY | O_CLOEXEC, 0666); });
  }
  ~Fresh() {
    if (!name.empty()) ::unlink(name.c_str());
  }
  Fresh(Fresh const&) = delete;
  Fresh& operator=(Fresh const&) = delete;

  // Gives the file a name that nothing has yet, with take(name), which returns below 0 when it cannot.
  template <class Take>
  int named(Take take) {
    for (unsigned i = 0;; ++i) {
      std::string free = folder + "/.talix-" + std::to_string(::getpid()) + "-" + std::to_string(i);
      int const result = take(free.c_str());
      if (result >= 0) name = std::move(free);
      if (result >= 0 || errno != EEXIST) return result >= 0 ? result : (fail(), -1);
    }
  }

  void moveTo(std::string const& path) {
    if (name.empty()) {
      std::string const link = "/proc/self/fd/" + std::to_string(fd);
      named([&](char const* free) {
        return ::linkat(AT_FDCWD, link.c_str(), AT_FDCWD, free, AT_SYMLINK_FOLLOW);
      });
    }
    if (::rename(name.c_str(), path.c_str()) != 0) fail();
    name.clear();
  }

  std::string folder;
  std::string name;  // empty: none
};

}  // namespace

void replaceFile(std::string const& path, std::function<void(std::ostream&)> const& write) {
  replaceFileThrough(path, [&](int file) {
    DescriptorBuffer buffer(file);
    std::ostream out(&buffer);
    write(out);
    out.flush();
    if (!out) fail(buffer.error() ? buffer.error() : EIO);
  });
}

void replaceFileThrough(std::string const& path, std::function<void(int)> const& write) {
  std::string const target = targetOf(path);
  struct stat former {};
  bool const exists = ::stat(target.c_str(), &former) == 0;
  if (exists && ::access(target.c_str(), W_OK) != 0) fail();
  Fresh file(folderOf(target));
  write(file.fd);
  if (exists && ::fchmod(file.fd, former.st_mode & 07777) != 0) fail();
  if (::fsync(file.fd) != 0) fail();
  file.moveTo(target);
  // The new name lasts once its folder is on disk. It stands already, so that a failure is none of the
  // caller's.
  if (Descriptor const folder{::open(file.folder.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC)};
      folder.fd >= 0)
    ::fsync(folder.fd);
}
