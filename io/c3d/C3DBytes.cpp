#include "io/c3d/C3DBytes.h"

#include "io/FileError.h"

namespace talix {

namespace {

// Calls visit with the number forms of a processor.
template <class Visit>
auto withNumbers(C3DProcessor processor, Visit visit) {
  switch (processor) {
    case C3DProcessor::DEC:
      return visit(C3DNumbers<C3DProcessor::DEC>());
    case C3DProcessor::MIPS:
      return visit(C3DNumbers<C3DProcessor::MIPS>());
    case C3DProcessor::Intel:
      break;
  }
  return visit(C3DNumbers<C3DProcessor::Intel>());
}

}  // namespace

char const* c3dProcessorName(C3DProcessor processor) {
  switch (processor) {
    case C3DProcessor::DEC:
      return "DEC";
    case C3DProcessor::MIPS:
      return "MIPS";
    case C3DProcessor::Intel:
      break;
  }
  return "Intel";
}

void C3DBytes::fail(size_t offset, std::string const& text) const {
  throw FileError::atOffset(path(), offset, text);
}

char const* C3DBytes::need(size_t offset, size_t length, char const* what) const {
  if (offset > size() || length > size() - offset)
    fail(offset, std::string("the file ends inside ") + what + " (" + std::to_string(length) +
                     " bytes expected, file size " + std::to_string(size()) + ")");
  return m_file.view().data() + offset;
}

unsigned C3DBytes::byte(size_t offset, char const* what) const {
  return static_cast<unsigned char>(*need(offset, 1, what));
}

unsigned C3DBytes::word(size_t offset, char const* what) const {
  char const* at = need(offset, 2, what);
  return withNumbers(m_processor, [at](auto numbers) { return numbers.word(at); });
}

int C3DBytes::integer(size_t offset, char const* what) const {
  return static_cast<std::int16_t>(word(offset, what));
}

double C3DBytes::real(size_t offset, char const* what) const {
  char const* at = need(offset, 4, what);
  return withNumbers(m_processor, [at](auto numbers) { return numbers.real(at); });
}

std::string_view C3DBytes::text(size_t offset, size_t length, char const* what) const {
  return {need(offset, length, what), length};
}

}  // namespace talix
