// Time of a scene: frame rate, current time, play, animation and selected ranges. Times are ticks.
#pragma once

#include <vector>

#include "host/time/HFrameRate.h"
#include "host/time/HTimeRange.h"

class Database;

class HTimeManager {
 public:
  enum ERoundDirection { RoundDown, RoundNearest, RoundUp };

  // A new scene's: 120 frames a second, "Custom", time 0, play and animation ranges 0 to 100 frames.
  // scene: whose time it is, which records changes of it; null: nobody's.
  explicit HTimeManager(Database* scene = nullptr);
  static HTimeManager* getInstance();  // that of the current scene
  void reset();

  HFrameRate const& getFrameRate() const { return m_rate; }
  // Changes the rate only: times, ranges and keys stay where they are in ticks.
  void setFrameRate(HFrameRate const& rate);
  int64 getTicksPerFrame() const { return m_rate.getTicksPerFrame(); }

  // Current time.
  int64 getTime() const { return m_time; }
  // The time of a frame; beyond the time line it is the time line's end.
  int64 getTime(int frame) const;
  // Moves the current time. notify does nothing.
  void setTime(int64 time, bool notify);

  // Ticks over ticks per frame, truncated toward zero.
  int getFrame(int64 time) const;
  double getFrameDouble(int64 time) const;
  // The nearest tick; beyond the time line it is the time line's end.
  int64 getTimeFromFrameDouble(double frame) const;
  bool isOnTimeLine(double frame) const;
  // The time of the frame boundary next to `time` in a direction, counted from `origin`. Stays on the time
  // line.
  int64 frameTime(int64 time, ERoundDirection direction, int64 origin) const;
  // Rounds the ends to frame boundaries counted from `origin`: outward, or inward. An empty range stays
  // as it is.
  void frameRange(HTimeRange& range, bool outward, int64 origin);

  // Frames from a text: a number of frames or timecode; 0 for other texts. `relative` reads timecode as a
  // length of time, of which drop-frame counting leaves nothing out.
  double stringToFrameDouble(HString const& text, bool relative) const;
  // The same; false for other texts.
  bool framesFromString(HString const& text, bool relative, double& frames) const;

  HTimeRange getAnimRange() const { return m_animRange; }
  HTimeRange getPlayRange() const { return m_playRange; }
  // chosen: by the user, so that a take is saved over this range.
  void setAnimRange(HTimeRange range, bool chosen);
  bool isAnimRangeChosen() const { return m_animRangeChosen; }
  // `keepTime`: the current time stays although it lies outside.
  void setPlayRange(HTimeRange range, bool keepTime);

  // The selected ranges, sorted and disjoint.
  int getNumSelectedRanges() const { return static_cast<int>(m_selected.size()); }
  HTimeRange getSelectedTimeRange(int i) const;  // empty beyond them
  void addSelectedTimeRange(HTimeRange range);
  void clearSelectedTimeRanges();

  // What undo brings back: all but the current time.
  struct Settings {
    HFrameRate rate;
    HTimeRange animRange, playRange;
    std::vector<HTimeRange> selected;
    bool animRangeChosen = false;
    bool operator==(Settings const&) const = default;
  };
  Settings getSettings() const { return {m_rate, m_animRange, m_playRange, m_selected, m_animRangeChosen}; }
  void swapSettings(Settings& settings) noexcept;

 private:
  void checkThread() const;
  void record();

  Database* m_scene;
  HFrameRate m_rate;
  int64 m_time = 0;
  HTimeRange m_animRange, m_playRange;
  bool m_animRangeChosen = false;
  std::vector<HTimeRange> m_selected;
};
