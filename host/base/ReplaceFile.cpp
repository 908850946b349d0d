#include "host/base/ReplaceFile.h"

#include <cerrno>
#include <fstream>
#include <sys/stat.h>
#include <system_error>
#include <unistd.h>

namespace {

// Closes the file at the end of a scope.
struct Descriptor {
  int fd;
  ~Descriptor() {
    if (fd >= 0) ::close(fd);
  }
};

[[noreturn]] void fail() { throw std::system_error(errno, std::generic_category()); }

}  // namespace

void replaceFile(const std::string& path, const std::function<void(std::ostream&)>& write) {
  std::string temporary = path + ".XXXXXX";
  const Descriptor file{::mkstemp(temporary.data())};
  if (file.fd < 0) fail();
  try {
    {
      std::ofstream out(temporary, std::ios::binary | std::ios::trunc);
      write(out);
      out.flush();
      if (!out) fail();
    }
    // A new file gets the rights that the user's mask allows, as if it had been created under its own name.
    struct stat status {};
    const mode_t mask = ::umask(0);
    ::umask(mask);
    ::fchmod(file.fd, ::stat(path.c_str(), &status) == 0 ? status.st_mode & 07777 : 0666 & ~mask);
    if (::fsync(file.fd) != 0) fail();
    if (::rename(temporary.c_str(), path.c_str()) != 0) fail();
  } catch (...) {
    ::unlink(temporary.c_str());
    throw;
  }
}
