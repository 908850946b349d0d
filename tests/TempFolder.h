// A folder of its own for a test, which goes at the end of it: two tests, or two runs of them, share no
// files.
#pragma once

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <stdexcept>
#include <string>

namespace talix_tests {

class TempFolder {
 public:
  TempFolder() {
    std::string name = (std::filesystem::temp_directory_path() / "talix.XXXXXX").string();
    if (!::mkdtemp(name.data())) throw std::runtime_error("no temporary folder");
    m_path = name;
  }
  ~TempFolder() { std::filesystem::remove_all(m_path); }
  TempFolder(TempFolder const&) = delete;
  TempFolder& operator=(TempFolder const&) = delete;

  std::string path(std::string const& name) const { return (m_path / name).string(); }
  // Writes a file and returns its path.
  std::string file(std::string const& name, std::string const& content) const {
    // Removed first: some file systems flush a file that is cut and written again, which takes milliseconds.
    std::filesystem::remove(path(name));
    std::ofstream(path(name), std::ios::binary) << content;
    return path(name);
  }

 private:
  std::filesystem::path m_path;
};

// What a file holds; nothing when it cannot be read.
inline std::string readText(std::string const& path) {
  std::ifstream in(path, std::ios::binary);
  return {std::istreambuf_iterator<char>(in), {}};
}

}  // namespace talix_tests
