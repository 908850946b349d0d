#include "app/Info.h"

#include <boost/json.hpp>
#include <iostream>

#include "app/InfoForms.h"
#include "io/FileError.h"
#include "io/TakeFormats.h"
#include "session/JsonForms.h"
#include "session/JsonText.h"

namespace talix {

std::string printable(std::string_view text) {
  std::string mended = mendedUtf8(text);
  for (char& c : mended)
    if (static_cast<unsigned char>(c) < 0x20 || c == 0x7f) c = '?';
  return mended;
}

std::string shortChannel(std::string const& channel) {
  if (channel.size() < 2) return printable(channel);
  bool const isRotation = (channel[1] | 0x20) == 'r';
  return std::string(1, isRotation ? 'R' : 'T') + static_cast<char>(channel[0] | 0x20);
}

int runInfo(std::vector<std::string> const& files, bool json) {
  constexpr int kUnreadable = 3;
  int status = 0;
  boost::json::array all;
  bool first = true;
  for (std::string const& file : files) {
    try {
      Take const take = readTake(file);
      if (json) {
        all.emplace_back(takeAsJson(take, file));
      } else {
        std::cout << (first ? "" : "\n") << takeAsText(take, file) << std::flush;
        first = false;
      }
    } catch (FileError const& error) {
      std::cerr << "error: " << printable(error.what()) << std::endl;
      if (json) all.push_back({{"file", printable(file)}, {"error", printable(error.what())}});
      status = kUnreadable;
    }
  }
  if (json) std::cout << jsonText(all) << std::endl;
  return std::cout.flush() ? status : kUnreadable;
}

}  // namespace talix
