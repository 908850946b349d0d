#include "host/time/HFrameRate.h"

#include <algorithm>
#include <cmath>
#include <cstdio>
#include <string_view>

namespace {

struct Standard {
  char const* name;
  double rate;  // 0: any
};
// In the order of ETimecodeStandard.
constexpr Standard kStandards[] = {{"ntsc", 30000.0 / 1001},
                                   {"ntscDrop", 30000.0 / 1001},
                                   {"pal", 25},
                                   {"film", 24},
                                   {"filmNtsc", 24000.0 / 1001},
                                   {"Custom", 0}};

// Drop-frame timecode leaves out the numbers of the first frames of every minute but each tenth: 2 for each
// 30 counted frames a second.
struct DropCount {
  int64 perSecond, dropped, perMinute, perTenMinutes;
  explicit DropCount(int64 counted)
      : perSecond(counted),
        dropped(counted / 30 * 2),
        perMinute(counted * 60 - dropped),
        perTenMinutes(counted * 600 - 9 * dropped) {}
  // The number that a frame carries when nothing is left out.
  int64 numberOf(int64 frame) const {
    int64 const tens = frame / perTenMinutes, rest = frame % perTenMinutes;
    int64 const minutes = rest < perMinute + dropped ? 0 : (rest - dropped) / perMinute;
    return frame + tens * 9 * dropped + minutes * dropped;
  }
};

}  // namespace

bool HFrameRate::setTimecodeStandard(ETimecodeStandard standard) {
  if (standard < NTSC || standard > CUSTOM) return false;
  m_standard = standard;
  if (kStandards[standard].rate > 0) setFrameRate(kStandards[standard].rate);
  return true;
}

void HFrameRate::setFrameRate(double rate) {
  if (!(rate > 0 && rate <= kMaximum)) return;
  // 29.97 and 23.976 are how 30000/1001 and 24000/1001 are written.
  constexpr double kAsWritten = 0.005;
  double const own = kStandards[m_standard].rate;
  m_rate = own > 0 && std::abs(rate - own) < kAsWritten ? own : rate;
  m_ticks = ticksPerFrameAt(m_rate);
}

HFrameRate HFrameRate::withoutDrop() const {
  HFrameRate rate = *this;
  if (rate.m_standard == NTSC_DROP) rate.m_standard = NTSC;
  return rate;
}

bool HFrameRate::getTimecodeStandardFromString(HString const& name, ETimecodeStandard& standard) {
  for (int i = NTSC; i <= CUSTOM; ++i)
    if (name == kStandards[i].name) return standard = static_cast<ETimecodeStandard>(i), true;
  return false;
}

char const* HFrameRate::getTimecodeStandardName(ETimecodeStandard standard) {
  return kStandards[standard].name;
}

int64 HFrameRate::countedFrames() const {
  return std::max<int64>(1, static_cast<int64>(std::ceil(m_rate - 1e-6)));
}

HString HFrameRate::timecodeFromFrame(int64 frame) const {
  int64 const counted = countedFrames();
  bool const drop = m_standard == NTSC_DROP;
  char const* sign = frame < 0 ? "-" : "";
  int64 number = std::abs(std::clamp(frame, -kForever, kForever));
  if (drop) number = DropCount(counted).numberOf(number);
  int64 const seconds = number / counted;
  HString text;
  text.Format("%s%02lld:%02lld:%02lld%c%02lld", sign, static_cast<long long>(seconds / 3600),
              static_cast<long long>(seconds / 60 % 60), static_cast<long long>(seconds % 60),
              drop ? ';' : ':', static_cast<long long>(number % counted));
  return text;
}

bool HFrameRate::frameFromTimecode(HString const& text, int64& frame) const {
  std::string_view rest = text.GetString();
  bool const negative = !rest.empty() && rest.front() == '-';
  if (negative) rest.remove_prefix(1);
  int64 fields[4];
  for (int i = 0; i < 4; ++i) {
    size_t digits = 0;
    fields[i] = 0;
    while (digits < rest.size() && digits < 9 && rest[digits] >= '0' && rest[digits] <= '9')
      fields[i] = fields[i] * 10 + (rest[digits++] - '0');
    if (digits == 0) return false;
    rest.remove_prefix(digits);
    if (i == 3) break;
    if (rest.empty() || !(rest.front() == ':' || (i == 2 && rest.front() == ';'))) return false;
    rest.remove_prefix(1);
  }
  int64 const counted = countedFrames();
  if (!rest.empty() || fields[1] > 59 || fields[2] > 59 || fields[3] >= counted) return false;
  int64 const minutes = fields[0] * 60 + fields[1];
  int64 number = (minutes * 60 + fields[2]) * counted + fields[3];
  if (m_standard == NTSC_DROP) {
    int64 const dropped = DropCount(counted).dropped;
    if (minutes % 10 != 0 && fields[2] == 0 && fields[3] < dropped) return false;
    number -= (minutes - minutes / 10) * dropped;
  }
  frame = negative ? -number : number;
  return true;
}
