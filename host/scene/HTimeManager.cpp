#include "host/scene/HTimeManager.h"

#include <algorithm>
#include <charconv>
#include <cmath>

#include "host/base/ItemAt.h"
#include "host/scene/Database.h"

HTimeManager::HTimeManager(Database* scene) : m_scene(scene) { reset(); }

HTimeManager* HTimeManager::getInstance() { return Database::current().getTimeManager(); }

void HTimeManager::reset() {
  m_rate = HFrameRate();
  m_time = 0;
  m_animRange = m_playRange = HTimeRange(0, getTime(100));
  m_animRangeChosen = false;
  m_selected.clear();
}

void HTimeManager::setFrameRate(HFrameRate const& rate) {
  record();
  m_rate = rate;
}

void HTimeManager::record() {
  if (m_scene) m_scene->recordSettings();
}

void HTimeManager::swapSettings(Settings& settings) noexcept {
  std::swap(m_rate, settings.rate);
  std::swap(m_animRange, settings.animRange);
  std::swap(m_playRange, settings.playRange);
  m_selected.swap(settings.selected);
  std::swap(m_animRangeChosen, settings.animRangeChosen);
}

void HTimeManager::checkThread() const {
  if (m_scene) m_scene->checkThread();
}

void HTimeManager::setTime(int64 time, bool) {
  checkThread();
  m_time = std::clamp(time, -kForever, kForever);
}

int64 HTimeManager::getTime(int frame) const {
  int64 const ticks = getTicksPerFrame();
  if (std::abs(int64{frame}) > kForever / ticks) return frame < 0 ? -kForever : kForever;
  return frame * ticks;
}

int HTimeManager::getFrame(int64 time) const {
  return static_cast<int>(std::clamp<int64>(time / getTicksPerFrame(), INT32_MIN, INT32_MAX));
}

double HTimeManager::getFrameDouble(int64 time) const {
  // Whole frames apart, so that times far from 0 keep their fraction.
  int64 const ticks = getTicksPerFrame();
  return static_cast<double>(time / ticks) + static_cast<double>(time % ticks) / static_cast<double>(ticks);
}

int64 HTimeManager::getTimeFromFrameDouble(double frame) const {
  if (std::isnan(frame)) return 0;
  int64 const ticks = getTicksPerFrame();
  double const whole = std::trunc(frame);
  if (!isOnTimeLine(frame)) return frame < 0 ? -kForever : kForever;
  return static_cast<int64>(whole) * ticks + std::llround((frame - whole) * static_cast<double>(ticks));
}

bool HTimeManager::isOnTimeLine(double frame) const {
  return std::abs(std::trunc(frame)) < static_cast<double>(kForever / getTicksPerFrame());
}

int64 HTimeManager::frameTime(int64 time, ERoundDirection direction, int64 origin) const {
  int64 const ticks = getTicksPerFrame();
  int64 past = (time - origin) % ticks;  // the last boundary
  if (past < 0) past += ticks;
  bool const up = past > 0 && (direction == RoundUp || (direction == RoundNearest && past >= ticks - past));
  return std::clamp(time + (up ? ticks - past : -past), -kForever, kForever);
}

void HTimeManager::frameRange(HTimeRange& range, bool outward, int64 origin) {
  if (range.isEmpty()) return;
  range.setEnds(frameTime(range.getStart(), outward ? RoundDown : RoundUp, origin),
                frameTime(range.getEnd(), outward ? RoundUp : RoundDown, origin));
}

double HTimeManager::stringToFrameDouble(HString const& text, bool relative) const {
  double frames = 0;
  return framesFromString(text, relative, frames) ? frames : 0;
}

bool HTimeManager::framesFromString(HString const& text, bool relative, double& frames) const {
  std::string const& s = text.GetString();
  auto const [end, error] = std::from_chars(s.data(), s.data() + s.size(), frames);
  if (error == std::errc() && end == s.data() + s.size() && std::isfinite(frames)) return true;
  HFrameRate const rate = relative ? m_rate.withoutDrop() : m_rate;
  int64 frame = 0;
  if (!rate.frameFromTimecode(text, frame)) return false;
  frames = static_cast<double>(frame);
  return true;
}

void HTimeManager::setAnimRange(HTimeRange range, bool chosen) {
  record();
  m_animRange = range;
  m_animRangeChosen = chosen;
}

HTimeRange HTimeManager::getSelectedTimeRange(int i) const { return itemAt(m_selected, i); }

void HTimeManager::setPlayRange(HTimeRange range, bool keepTime) {
  record();
  m_playRange = range;
  if (!keepTime && !range.isEmpty()) setTime(std::clamp(m_time, range.getStart(), range.getEnd()), true);
}

void HTimeManager::clearSelectedTimeRanges() {
  record();
  m_selected.clear();
}

void HTimeManager::addSelectedTimeRange(HTimeRange range) {
  if (range.isEmpty()) return;
  record();
  auto const before = [](HTimeRange const& a, HTimeRange const& b) { return a.getEnd() < b.getStart(); };
  // All ranges that meet the new one grow into it.
  auto const [first, last] = std::equal_range(m_selected.begin(), m_selected.end(), range, before);
  for (auto met = first; met != last; ++met) range.include(*met);
  m_selected.insert(m_selected.erase(first, last), range);
}
