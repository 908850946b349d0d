#include "io/TakeFormats.h"

#include <filesystem>

#include "io/FileBytes.h"
#include "io/FileError.h"
#include "io/TextScanner.h"

namespace talix {

namespace {

enum class Format : unsigned char { None, C3D, BVH, TRC };

Format formatBySuffix(const std::string& path) {
  const std::string suffix = std::filesystem::path(path).extension().string();
  if (equalsIgnoringCase(suffix, ".c3d")) return Format::C3D;
  if (equalsIgnoringCase(suffix, ".bvh")) return Format::BVH;
  if (equalsIgnoringCase(suffix, ".trc")) return Format::TRC;
  return Format::None;
}

Format formatByContent(const std::string& path) {
  const FileBytes bytes(path);
  constexpr char kC3DMark = 0x50;
  if (TextScanner scanner(bytes); scanner.accept("hierarchy")) return Format::BVH;
  if (TextScanner scanner(bytes); scanner.accept("pathfiletype")) return Format::TRC;
  if (bytes.view().size() > 1 && bytes.view()[1] == kC3DMark) return Format::C3D;
  return Format::None;
}

}  // namespace

Take readTake(const std::string& path, const ReadOptions& options) {
  Format format = formatByContent(path);
  if (format == Format::None) format = formatBySuffix(path);
  switch (format) {
    case Format::C3D:
      return readC3D(path, options);
    case Format::BVH:
      return readBVH(path, options);
    case Format::TRC:
      return readTRC(path, options);
    case Format::None:
      break;
  }
  throw FileError(path, "is no take that can be read (C3D, BVH or TRC)");
}

namespace {

using Writer = void (*)(const Take&, const std::string&, std::vector<TakeNote>&);

Writer writerFor(const std::string& path) {
  const Format format = formatBySuffix(path);
  if (format == Format::C3D) return writeC3D;
  if (format == Format::BVH) return writeBVH;
  throw FileError(path, "takes are written as C3D or BVH: a name ending in .c3d or .bvh expected");
}

}  // namespace

void checkTakeTarget(const std::string& path) {
  writerFor(path);
  std::error_code error;
  const std::filesystem::path folder = std::filesystem::absolute(path, error).parent_path();
  if (error || !std::filesystem::is_directory(folder, error))
    throw FileError(path, "cannot be written: there is no such folder");
}

void writeTake(const Take& take, const std::string& path, std::vector<TakeNote>& notes) {
  writerFor(path)(take, path, notes);
}

}  // namespace talix
