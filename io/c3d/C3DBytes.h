// Bounds-checked reading of a C3D file's bytes, whose numbers come in the forms of three processors.
#pragma once

#include <bit>
#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>

#include "io/FileBytes.h"

namespace talix {

// Files are laid out in blocks of this size, counted from 1.
inline constexpr size_t kC3DBlock = 512;

// The values are those in the file.
enum class C3DProcessor : unsigned char { Intel = 84, DEC = 85, MIPS = 86 };

char const* c3dProcessorName(C3DProcessor);

// The numbers of one processor at a place that is known to hold them.
template <C3DProcessor processor>
struct C3DNumbers {
  static unsigned word(char const* at) {
    unsigned const first = static_cast<unsigned char>(at[0]), second = static_cast<unsigned char>(at[1]);
    return processor == C3DProcessor::MIPS ? first << 8 | second : second << 8 | first;
  }
  static int integer(char const* at) { return static_cast<std::int16_t>(word(at)); }
  static double real(char const* at) {
    if constexpr (processor == C3DProcessor::MIPS) return std::bit_cast<float>(word(at) << 16 | word(at + 2));
    if constexpr (processor == C3DProcessor::Intel)
      return std::bit_cast<float>(word(at + 2) << 16 | word(at));
    return decReal(word(at) << 16 | word(at + 2));
  }

 private:
  // Sign, 8 bits of exponent with a bias of 129 and 23 bits of fraction after a hidden one; no infinities,
  // no denormals. Exponent 0 is zero, with the sign set it is a reserved operand and comes out as
  // not-a-number.
  static double decReal(std::uint32_t bits) {
    std::uint64_t const sign = bits >> 31, exponent = bits >> 23 & 0xff, fraction = bits & 0x7fffff;
    if (exponent == 0) return sign ? std::bit_cast<double>(std::uint64_t{0x7ff8} << 48) : 0.0;
    return std::bit_cast<double>(sign << 63 | (exponent + 1023 - 129) << 52 | fraction << 29);
  }
};

// Reads at any offset; throws FileError, naming file, offset and `what` was to be read, where the file ends
// first.
class C3DBytes {
 public:
  explicit C3DBytes(FileBytes const& file) : m_file(file) {}

  void setProcessor(C3DProcessor processor) { m_processor = processor; }
  C3DProcessor processor() const { return m_processor; }
  size_t size() const { return m_file.view().size(); }
  std::string const& path() const { return m_file.path(); }

  unsigned byte(size_t offset, char const* what) const;
  unsigned word(size_t offset, char const* what) const;  // unsigned
  int integer(size_t offset, char const* what) const;    // signed, two bytes
  double real(size_t offset, char const* what) const;
  std::string_view text(size_t offset, size_t length, char const* what) const;

  [[noreturn]] void fail(size_t offset, std::string const& text) const;

 private:
  char const* need(size_t offset, size_t length, char const* what) const;

  FileBytes const& m_file;
  C3DProcessor m_processor = C3DProcessor::Intel;
};

}  // namespace talix
