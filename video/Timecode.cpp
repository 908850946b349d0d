#include "video/Timecode.h"

#include <algorithm>
#include <cstdio>

namespace talix_video {

Timecode::Timecode(AVRational rate) {
  m_code.rate = rate;
  m_code.fps = static_cast<unsigned>(std::max<int64_t>(1, (rate.num + int64_t{rate.den} / 2) / rate.den));
  m_code.flags = AV_TIMECODE_FLAG_24HOURSMAX;
}

std::optional<Timecode> Timecode::parse(std::string const& text, AVRational rate) {
  unsigned hours = 0, minutes = 0, seconds = 0, frames = 0;
  char dot = 0, rest = 0;
  if (std::sscanf(text.c_str(), "%2u:%2u:%2u%c%3u%c", &hours, &minutes, &seconds, &dot, &frames, &rest) !=
          5 ||
      (dot != ':' && dot != ';' && dot != '.'))
    return std::nullopt;
  Timecode code(rate);
  unsigned const fps = code.m_code.fps;
  auto const totalMinutes = static_cast<int>(hours * 60 + minutes);
  code.m_code.start = static_cast<int>((static_cast<unsigned>(totalMinutes) * 60 + seconds) * fps + frames);
  if (dot != ':' && fps % 30 == 0) {
    code.m_code.flags |= AV_TIMECODE_FLAG_DROPFRAME;
    // Two numbers of each minute but every tenth, at 30 frames a second.
    code.m_code.start -= static_cast<int>(fps / 30 * 2) * (totalMinutes - totalMinutes / 10);
  }
  return code;
}

std::string Timecode::at(int64_t frame) const {
  char text[AV_TIMECODE_STR_SIZE];
  // A day later it is the same again; a number of frames that large is no int.
  int64_t const day = int64_t{24} * 60 * 60 * m_code.fps;
  bool const drops = m_code.flags & AV_TIMECODE_FLAG_DROPFRAME;
  int64_t const period = drops ? day - int64_t{m_code.fps / 30 * 2} * (24 * 60 - 24 * 6) : day;
  AVTimecode code = m_code;
  code.start = 0;
  int64_t const number = ((frame + m_code.start) % period + period) % period;
  return av_timecode_make_string(&code, text, static_cast<int>(number));
}

}  // namespace talix_video
