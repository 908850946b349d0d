#include "io/c3d/C3DGrid.h"

namespace talix {

namespace {

bool whole(KeyTrack::Key const& key) { return key.components == KeyTrack::kAll; }

}  // namespace

C3DLeftOver c3dLeftOver(KeyTrack const& track, C3DGrid const& grid) {
  C3DLeftOver left;
  track.forEach(0, track.count(), [&](KeyTrack::Key const& key) {
    int64 const fromStart = key.time - grid.start;
    if (fromStart % grid.period != 0)
      ++left.between;
    else if (fromStart < 0 || fromStart / grid.period >= grid.count)
      ++left.outside;
    else if (!whole(key))
      ++left.partial;
  });
  return left;
}

C3DGridReader::C3DGridReader(KeyTrack const& track, C3DGrid const& grid)
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

KeyTrack::Key const* C3DGridReader::next() {
  while (m_hasKey && m_key.time < m_time) advance();
  bool const found = m_hasKey && m_key.time == m_time && whole(m_key);
  m_time += m_period;
  return found ? &m_key : nullptr;
}

}  // namespace talix
