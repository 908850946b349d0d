// The timecode that runs through a video.
#pragma once

#include <cstdint>
#include <optional>
#include <string>

#include "video/Av.h"

namespace talix_video {

class Timecode {
 public:
  // 00:00:00:00
  explicit Timecode(AVRational rate);
  // "HH:MM:SS:FF" or, where frame numbers are dropped, "HH:MM:SS;FF". Nothing for any other text.
  static std::optional<Timecode> parse(std::string const& text, AVRational rate);

  // So many frames later.
  std::string at(int64_t frame) const;

 private:
  AVTimecode m_code{};
};

}  // namespace talix_video
