#include "host/base/HStringArray.h"

#include <string_view>

namespace {

// Length of the longest delimiter that stands at the start of `rest`.
size_t delimiterAt(std::string_view rest, HStringArray const& delimiters) {
  size_t longest = 0;
  for (HString const& delimiter : delimiters) {
    std::string_view const d = delimiter.GetString();
    if (d.size() > longest && rest.substr(0, d.size()) == d) longest = d.size();
  }
  return longest;
}

std::string_view trimmed(std::string_view piece) {
  size_t const first = piece.find_first_not_of(" \t");
  if (first == std::string_view::npos) return {};
  return piece.substr(first, piece.find_last_not_of(" \t") - first + 1);
}

}  // namespace

void HStringArray::Tokenize(HString const& text, HStringArray const& delimiters, HStringArray& out,
                            bool keepEmpty, bool trim) {
  out.clear();
  std::string_view const all = text.GetString();
  size_t start = 0;
  auto const finish = [&](size_t end) {
    std::string_view piece = all.substr(start, end - start);
    if (trim) piece = trimmed(piece);
    if (keepEmpty || !piece.empty()) out.add(HString(piece));
  };
  for (size_t at = 0; at < all.size();) {
    size_t const length = delimiterAt(all.substr(at), delimiters);
    if (length == 0) {
      ++at;
      continue;
    }
    finish(at);
    start = at += length;
  }
  finish(all.size());
}
