#include "io/scene/FrameSampler.h"

#include <algorithm>

#include "host/keys/DataRanges.h"
#include "io/TakeSource.h"

namespace talix {

namespace {

// With or without keys: a marker that was never seen has an empty one.
bool hasTrack(Controller const& channel, NLEClip const& clip) {
  for (int layer = 0; layer < clip.getNumLayers(); ++layer)
    if (channel.findTrack(&clip, layer)) return true;
  return false;
}

}  // namespace

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

NLEClip const* FrameSampler::shown() const { return m_scene.getActiveClip(); }

void FrameSampler::markGaps(Controller const& channel, SampleTimes const& times, bool* known) const {
  if (!m_clip || times.count() == 0) return;
  KeyTrack const* track = dataTrack(channel);
  if (!track) return void(std::fill_n(known, times.count(), false));
  int64 const start = times[0], period = times.period();
  DataRanges const data(*track, period);
  if (start % period != 0) {
    // Times of an odd rate, which lie at no multiple of their period.
    for (int64 i = 0; i < times.count(); ++i) known[i] = known[i] && data.hasDataAt(times[i]);
    return;
  }
  data.visitGaps(start, times[times.count() - 1], [&](int64 first, int64 last) {
    std::fill(known + (first - start) / period, known + (last - start) / period + 1, false);
  });
}

void FrameSampler::sample(Controller const& channel, SampleTimes const& times, double* values) const {
  if (!m_blends) return channel.sample(m_clip, times, values);
  auto const width = static_cast<size_t>(Controller::shapeOf(channel.getPropertyType()));
  Controller::Values each{};
  for (int64 i = 0; i < times.count(); ++i, values += width) {
    channel.evaluate(times[i], each);
    std::copy_n(each.data(), width, values);
  }
}

int64 FrameSampler::keysOff(Controller const& channel, SampleTimes const& times) const {
  KeyTrack const* track = dataTrack(channel);
  return track ? keysLeftOut(*track, times).off() : 0;
}

}  // namespace talix
