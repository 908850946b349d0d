// A frame rate and the timecode standard it is counted in.
#pragma once

#include "host/base/HString.h"
#include "host/time/Ticks.h"

enum ETimecodeStandard { NTSC, NTSC_DROP, PAL, FILM, FILM_NTSC, CUSTOM };

class HFrameRate {
 public:
  static constexpr double kMaximum = 2000;  // frames a second

  HFrameRate() = default;  // 120 frames a second, custom

  ETimecodeStandard getTimecodeStandard() const { return m_standard; }
  double getFrameRate() const { return m_rate; }
  int64 getTicksPerFrame() const { return m_ticks; }

  // Takes on the standard's own rate; a custom standard keeps the rate. False for a number that is no
  // standard.
  bool setTimecodeStandard(ETimecodeStandard standard);
  // Frames a second, above 0 and at most kMaximum; other rates are not taken. One within 0.005 of the
  // standard's own rate stands for that (29.97 for 30000/1001).
  void setFrameRate(double rate);

  // This rate with timecode that leaves no number out: what a length of time is counted in.
  HFrameRate withoutDrop() const;

  // "ntsc", "ntscDrop", "pal", "film", "filmNtsc", "Custom", in exact case.
  static bool getTimecodeStandardFromString(HString const& name, ETimecodeStandard& standard);
  static char const* getTimecodeStandardName(ETimecodeStandard standard);

  // The frame number as HH:MM:SS:FF at this rate (";" before the frames of drop-frame timecode), with a sign
  // when negative.
  HString timecodeFromFrame(int64 frame) const;
  // False when the text is no timecode, or names a frame that drop-frame timecode leaves out.
  bool frameFromTimecode(HString const& text, int64& frame) const;

  bool operator==(HFrameRate const&) const = default;

 private:
  // Frames that timecode counts in a second: the rate rounded up (29.97 counts 30).
  int64 countedFrames() const;

  ETimecodeStandard m_standard = CUSTOM;
  double m_rate = 120;
  int64 m_ticks = ticksPerFrameAt(120);
};
