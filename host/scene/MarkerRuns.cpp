#include "host/scene/MarkerRuns.h"

#include <algorithm>
#include <vector>

#include "host/scene/Clips.h"
#include "host/scene/Database.h"

namespace {

// Keys that are gone, between one that stayed and the next that did (-kForever, kForever: none).
struct Run {
  int64 before, last, next;
};

// Those from `first` to `last`.
std::vector<Run> goneRuns(KeyTrack const& original, KeyTrack const& left, int64 first, int64 last) {
  // From the key before the range, which stayed, to the key behind it.
  const int64 begin = std::max<int64>(original.lowerBound(first) - 1, 0);
  const int64 end = std::min(original.lowerBound(last + 1) + 1, original.count());
  std::vector<Run> runs;
  if (begin >= end) return runs;
  const int64 from = left.lowerBound(original.timeAt(begin));
  KeyTrack::Reader rest(left, from);
  int64 count = left.count() - from, before = -kForever, gone = 0;
  int64 next = count > 0 ? rest.next().time : kForever;
  bool open = false;
  original.forEach(begin, end, [&](KeyTrack::Key const& key) {
    if (key.time != next) {
      gone = key.time;
      open = true;
      return;
    }
    if (open) runs.push_back({before, gone, key.time});
    open = false;
    before = key.time;
    next = --count > 0 ? rest.next().time : kForever;
  });
  if (open) runs.push_back({before, gone, kForever});
  return runs;
}

// The fill types of all layers while they are changed.
class FillTypes {
 public:
  FillTypes(Marker& marker, NLEClip* clip, int layer)
      : m_channel(*marker.addChannel("FillType", DataSource::IntProperty)), m_clip(clip), m_layer(layer) {
    for (int i = 0; i < clip->getNumLayers(); ++i) m_layers.push_back(now(i));
  }
  ~FillTypes() {
    m_channel.beginDataEdit(HTimeRange::forever());
    for (int i = 0; i < m_clip->getNumLayers(); ++i) {
      KeyTrack& track = m_layers[static_cast<size_t>(i)];
      if (!track.sharesAll(now(i))) m_channel.setTrack(m_clip, i, std::move(track));
    }
    m_channel.endDataEdit();
  }
  FillTypes(FillTypes const&) = delete;
  FillTypes& operator=(FillTypes const&) = delete;

  KeyTrack& own() { return m_layers[static_cast<size_t>(m_layer)]; }
  bool has(int64 time) const {
    return std::any_of(m_layers.begin(), m_layers.end(),
                       [&](KeyTrack const& each) { return each.find(time) >= 0; });
  }
  void erase(int64 first, int64 last) {
    for (KeyTrack& track : m_layers) track.eraseRange(first, last);
  }

 private:
  KeyTrack now(int layer) const {
    KeyTrack const* track = m_channel.findTrack(m_clip, layer);
    return track ? *track : KeyTrack(KeyTrack::Shape::Scalar);
  }

  Controller& m_channel;
  NLEClip* m_clip;
  int m_layer;
  std::vector<KeyTrack> m_layers;
};

}  // namespace

void markReduced(Marker& marker, NLEClip* clip, int layer, KeyTrack const& before, KeyTrack const& after) {
  const std::vector<Run> runs = goneRuns(before, after, -kForever, kForever - 1);
  if (runs.empty()) return;
  FillTypes types(marker, clip, layer);
  // The first mark shall not count for the frames before it.
  if (types.own().empty() || types.own().timeAt(0) > runs.front().before)
    types.own().set(before.timeAt(0), {Marker::Recorded});
  for (Run const& run : runs) {
    types.erase(run.before, run.last);
    types.own().set(run.before, {Marker::Reduced});
    if (!types.has(run.next)) types.own().set(run.next, {Marker::Recorded});
  }
}

CutRuns::CutRuns(Controller const& channel, int64 first, int64 last)
    : m_clip(channel.getDatabase()->getActiveClip()),
      m_first(first),
      m_last(last),
      m_before(KeyTrack::Shape::Vector) {
  auto* marker = objectAs<Marker>(channel.getModule());
  if (!m_clip || !marker || marker->getTranslationChannel() != &channel) return;
  Controller const* types = marker->getChannel("FillType");
  if (!types || !types->hasKeysInClip(m_clip)) return;
  // The keys of the lowest layer that has any tell what was seen.
  for (; m_layer < m_clip->getNumLayers(); ++m_layer) {
    KeyTrack const* track = channel.findTrack(m_clip, m_layer);
    if (!track || track->empty()) continue;
    m_marker = marker;
    m_before = *track;
    return;
  }
}

CutRuns::~CutRuns() {
  if (!m_marker) return;
  KeyTrack const& after = *m_marker->getTranslationChannel()->findTrack(m_clip, m_layer);
  if (after.sharesAll(m_before)) return;
  struct Cut : Run {
    bool endsBefore, goesOn;
  };
  std::vector<Cut> cuts;
  for (Run const& run : goneRuns(m_before, after, m_first, m_last)) {
    const Marker::EFillType own = m_marker->getFillType(run.before);
    const bool speaks =
        own == Marker::Recorded || own == Marker::Reduced;  // of what is behind it, not of itself
    cuts.push_back({run, run.before > -kForever && speaks && m_marker->isReducedBehind(run.before),
                    run.next < kForever && m_marker->isReducedBehind(run.next)});
  }
  if (cuts.empty()) return;
  FillTypes types(*m_marker, m_clip, m_layer);
  for (Cut const& cut : cuts) {
    types.erase(cut.before + 1, cut.next - 1);
    if (cut.endsBefore) {
      types.erase(cut.before, cut.before);
      types.own().set(cut.before, {Marker::Recorded});
    }
    if (cut.goesOn && !types.has(cut.next)) types.own().set(cut.next, {Marker::Reduced});
  }
}
