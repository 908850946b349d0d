#include "io/c3d/C3DGrid.h"

namespace talix {

namespace {

bool whole(const KeyTrack::Key& key) { return key.components == KeyTrack::kAll; }

}  // namespace

C3DLeftOver c3dLeftOver(const KeyTrack& track, const C3DGrid& grid) {
  C3DLeftOver left;
  track.forEach(0, track.count(), [&](const KeyTrack::Key& key) {
    const int64 fromStart = key.time - grid.start;
    if (fromStart % grid.period != 0)
      ++left.between;
    else if (fromStart < 0 || fromStart / grid.period >= grid.count)
      ++left.outside;
    else if (!whole(key))
      ++left.partial;
  });
  return left;
}

C3DGridReader::C3DGridReader(const KeyTrack& track, const C3DGrid& grid)
    : m_reader(track, track.lowerBound(grid.start)),
      m_left(track.count() - track.lowerBound(grid.start)),
      m_time(grid.start),
      m_period(grid.period) {
  advance();
}

void C3DGridReader::advance() {
  m_hasKey = m_left > 0;
  if (!m_hasKey) return;
  --m_left;
  m_key = m_reader.next();
}

const KeyTrack::Key* C3DGridReader::next() {
  while (m_hasKey && m_key.time < m_time) advance();
  const bool found = m_hasKey && m_key.time == m_time && whole(m_key);
  m_time += m_period;
  return found ? &m_key : nullptr;
}

}  // namespace talix
