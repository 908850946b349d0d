#include "io/scene/FrameSampler.h"

#include <algorithm>

#include "host/keys/DataRanges.h"

namespace talix {

namespace {

// With or without keys: a marker that was never seen has an empty one.
bool hasTrack(Controller const& channel, NLEClip const& clip) {
  for (int layer = 0; layer < clip.getNumLayers(); ++layer)
    if (channel.findTrack(&clip, layer)) return true;
  return false;
}

}  // namespace

void FrameRun::add(int64 frame, double const* values) {
  if (m_count > 0 && frame != m_first + m_count) flush();
  if (m_count == 0) m_first = frame;
  m_values.insert(m_values.end(), values, values + m_track.width());
  ++m_count;
}

KeyTrack FrameRun::take() {
  flush();
  return std::move(m_track);
}

void FrameRun::flush() {
  if (m_count > 0)
    m_track.append(m_grid.start() + m_first * m_grid.period, m_grid.period, m_values.data(), m_count);
  m_values.clear();
  m_count = 0;
}

FrameSampler::FrameSampler(Database const& scene, FrameGrid const& grid) : m_scene(scene), m_grid(grid) {
  NLEClip const* active = scene.getActiveClip();
  m_blends = active && !active->holdsKeys();
  if (!m_blends) m_clip = active;
}

bool FrameSampler::belongsToClip(Controller const& channel) const {
  if (!m_clip || hasTrack(channel, *m_clip)) return true;
  for (NLEClip const* clip = m_scene.getHeadClip(); clip; clip = clip->getNext())
    if (hasTrack(channel, *clip)) return false;
  return true;
}

bool FrameSampler::mayChange(Controller const& channel) const {
  if (!m_blends) return hasKeys(channel);
  for (NLEClip const* clip = m_scene.getHeadClip(); clip; clip = clip->getNext())
    if (channel.hasKeysInClip(clip)) return true;
  return false;
}

KeyTrack const* FrameSampler::asItIs(Controller const& channel) const {
  KeyTrack const* lowest = dataTrack(channel);
  if (!lowest || lowest != channel.findTrack(m_clip, 0)) return nullptr;
  for (int layer = 1; layer < m_clip->getNumLayers(); ++layer)
    if (KeyTrack const* track = channel.findTrack(m_clip, layer); track && !track->empty()) return nullptr;
  if (lowest->countHolding(1) != lowest->count() || lowest->countHolding(2) != lowest->count() ||
      lowest->countHolding(4) != lowest->count() || lowest->countSelected() > 0 || lowest->bridgesAny())
    return nullptr;
  return keysOffGrid(channel) == 0 ? lowest : nullptr;
}

KeyTrack FrameSampler::sampleWhere(std::vector<bool> const& frames, Controller const& channel) const {
  FrameRun run(Controller::shapeOf(channel.getPropertyType()), m_grid);
  Controller::Values values{};
  for (int64 i = 0; i < m_grid.count; ++i) {
    if (!frames[static_cast<size_t>(i)]) continue;
    channel.evaluate(m_grid.start() + i * m_grid.period, values);
    run.add(i, values.data());
  }
  return run.take();
}

KeyTrack FrameSampler::everyFrame(Controller const& channel) const {
  if (KeyTrack const* track = asItIs(channel); track && track->count() == m_grid.count) return *track;
  return sampleWhere(std::vector<bool>(static_cast<size_t>(m_grid.count), true), channel);
}

std::vector<bool> FrameSampler::framesWithData(Controller const& channel) const {
  std::vector<bool> frames(static_cast<size_t>(m_grid.count), m_clip == nullptr);
  KeyTrack const* track = dataTrack(channel);
  if (!track || m_grid.count == 0) return frames;
  DataRanges(*track, m_grid.period).visitRanges(m_grid.start(), m_grid.end(), [&](int64 start, int64 end) {
    std::fill(frames.begin() + (start - m_grid.start()) / m_grid.period,
              frames.begin() + (end - m_grid.start()) / m_grid.period + 1, true);
  });
  return frames;
}

int64 FrameSampler::keysOffGrid(Controller const& channel) const {
  KeyTrack const* track = dataTrack(channel);
  if (!track) return 0;
  int64 off = 0;
  track->forEach(0, track->count(), [&](KeyTrack::Key const& key) { off += !m_grid.contains(key.time); });
  return off;
}

}  // namespace talix
