#include "io/TakeFormats.h"

#include <filesystem>

#include "io/FileBytes.h"
#include "io/FileError.h"
#include "io/TextScanner.h"

namespace talix {

namespace {

enum class Format : unsigned char { None, C3D, BVH, TRC };

Format formatBySuffix(std::string const& path) {
  std::string const suffix = std::filesystem::path(path).extension().string();
  if (equalsIgnoringCase(suffix, ".c3d")) return Format::C3D;
  if (equalsIgnoringCase(suffix, ".bvh")) return Format::BVH;
  if (equalsIgnoringCase(suffix, ".trc")) return Format::TRC;
  return Format::None;
}

Format formatByContent(std::string const& path) {
  FileBytes const bytes(path);
  constexpr char kC3DMark = 0x50;
  if (TextScanner scanner(bytes); scanner.accept("hierarchy")) return Format::BVH;
  if (TextScanner scanner(bytes); scanner.accept("pathfiletype")) return Format::TRC;
  if (bytes.view().size() > 1 && bytes.view()[1] == kC3DMark) return Format::C3D;
  return Format::None;
}

}  // namespace

Take readTake(std::string const& path, ReadOptions const& options) {
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

using Writer = void (*)(TakeSource const&, std::string const&, std::vector<TakeNote>&);

Writer writerFor(std::string const& path) {
  Format const format = formatBySuffix(path);
  if (format == Format::C3D) return writeC3D;
  if (format == Format::BVH) return writeBVH;
  throw FileError(path, "takes are written as C3D or BVH: a name ending in .c3d or .bvh expected");
}

}  // namespace

void checkTakeTarget(std::string const& path) {
  writerFor(path);
  std::error_code error;
  std::filesystem::path const folder = std::filesystem::absolute(path, error).parent_path();
  if (error || !std::filesystem::is_directory(folder, error))
    throw FileError(path, "cannot be written: there is no such folder");
}

void writeTake(TakeSource const& take, std::string const& path, std::vector<TakeNote>& notes) {
  writerFor(path)(take, path, notes);
}

}  // namespace talix
