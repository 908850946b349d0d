#include "app/Info.h"

#include <boost/json.hpp>
#include <iostream>

#include "app/InfoForms.h"
#include "io/FileError.h"
#include "io/TakeFormats.h"

namespace talix {

namespace {

// The length of the UTF-8 character that the text begins with; 0: none that shows.
size_t characterLength(std::string_view text) {
  const auto byte = [&](size_t i) { return static_cast<unsigned char>(text[i]); };
  const size_t length = byte(0) < 0x80   ? 1
                        : byte(0) < 0xc2 ? 0
                        : byte(0) < 0xe0 ? 2
                        : byte(0) < 0xf0 ? 3
                        : byte(0) < 0xf5 ? 4
                                         : 0;
  if (length == 0 || text.size() < length) return 0;
  for (size_t i = 1; i < length; ++i)
    if ((byte(i) & 0xc0) != 0x80) return 0;
  // Longer forms than needed, surrogates, and what lies beyond the last character.
  if (length == 3 && ((byte(0) == 0xe0 && byte(1) < 0xa0) || (byte(0) == 0xed && byte(1) >= 0xa0))) return 0;
  if (length == 4 && ((byte(0) == 0xf0 && byte(1) < 0x90) || (byte(0) == 0xf4 && byte(1) >= 0x90))) return 0;
  return length;
}

bool isControl(std::string_view character) {
  const auto first = static_cast<unsigned char>(character[0]);
  return first < 0x20 || first == 0x7f || (first == 0xc2 && static_cast<unsigned char>(character[1]) < 0xa0);
}

}  // namespace

std::string printable(std::string_view text) {
  std::string result;
  while (!text.empty()) {
    if (const size_t length = characterLength(text)) {
      result += isControl(text.substr(0, length)) ? std::string_view("?") : text.substr(0, length);
      text.remove_prefix(length);
      continue;
    }
    const auto latin = static_cast<unsigned char>(text[0]);
    if (latin < 0xa0) {
      result += '?';
    } else {
      result += static_cast<char>(0xc0 | (latin >> 6));
      result += static_cast<char>(0x80 | (latin & 0x3f));
    }
    text.remove_prefix(1);
  }
  return result;
}

std::string shortChannel(const std::string& channel) {
  if (channel.size() < 2) return printable(channel);
  const bool isRotation = (channel[1] | 0x20) == 'r';
  return std::string(1, isRotation ? 'R' : 'T') + static_cast<char>(channel[0] | 0x20);
}

int runInfo(std::vector<std::string> const& files, bool json) {
  constexpr int kUnreadable = 3;
  int status = 0;
  boost::json::array all;
  bool first = true;
  for (const std::string& file : files) {
    try {
      const Take take = readTake(file);
      if (json) {
        all.emplace_back(takeAsJson(take, file));
      } else {
        std::cout << (first ? "" : "\n") << takeAsText(take, file) << std::flush;
        first = false;
      }
    } catch (const FileError& error) {
      std::cerr << "error: " << printable(error.what()) << std::endl;
      if (json) all.push_back({{"file", printable(file)}, {"error", printable(error.what())}});
      status = kUnreadable;
    }
  }
  if (json) std::cout << boost::json::serialize(all) << std::endl;
  return status;
}

}  // namespace talix
