#include "host/scene/motion/MarkerPacker.h"

#include <algorithm>
#include <map>
#include <vector>

#include "host/keys/DataRanges.h"
#include "host/keys/SampleTimes.h"
#include "host/scene/DataEdit.h"
#include "host/scene/Database.h"
#include "host/scene/Editability.h"

namespace {

// A stretch of frames with data.
struct Run {
  NLEClip* clip;
  int64 start, end;  // times of its first and last frame
  Vec3 first, last;  // positions there
};

std::vector<Run> runsOf(Marker const& marker, NLEClip* clip) {
  std::vector<Run> runs;
  Controller const& channel = *marker.getTranslationChannel();
  KeyTrack const* track = channel.findDataTrack(clip);
  if (!track) return runs;
  int64 const period = clip->getFramePeriod();
  DataRanges(*track, period)
      .visitRanges(track->timeAt(0) - period, track->timeAt(track->count() - 1) + period,
                   [&](int64 start, int64 end) {
                     Run run{clip, start, end, {}, {}};
                     channel.sample(clip, SampleTimes(start, 1, 1), &run.first.x);
                     channel.sample(clip, SampleTimes(end, 1, 1), &run.last.x);
                     runs.push_back(run);
                   });
  return runs;
}

// Of all clips, by clip and time.
std::vector<Run> runsOf(Marker const& marker) {
  std::vector<Run> runs;
  for (NLEClip* clip = marker.getDatabase()->getHeadClip(); clip; clip = clip->getNext())
    if (clip->holdsKeys())
      for (Run const& run : runsOf(marker, clip)) runs.push_back(run);
  return runs;
}

struct Trajectory {
  Marker* marker;
  std::vector<Run> runs;  // at least one

  int64 start() const { return runs.front().start; }
};

// Several trajectories in one marker: that of the first.
struct Chain {
  std::vector<Trajectory const*> members;
  std::map<std::pair<NLEClip*, int64>, Run const*> runs;  // by clip and start

  void add(Trajectory const& trajectory) {
    members.push_back(&trajectory);
    for (Run const& run : trajectory.runs) runs.emplace(std::pair(run.clip, run.start), &run);
  }
};

class Packing {
 public:
  Packing(int minimumGap, double minimumDistance)
      : m_minimumGap(std::max(minimumGap, 0)), m_minimumDistance(minimumDistance) {}

  // Whether a run may come right after another.
  bool follows(Run const& earlier, Run const& later) const {
    int64 const period = later.clip->getFramePeriod();
    return later.start > earlier.end && (later.start - earlier.end) / period - 1 >= m_minimumGap &&
           !((later.first - earlier.last).length() < m_minimumDistance);
  }

  bool fits(Chain const& chain, Trajectory const& trajectory) const {
    if (!isSameSpace(*chain.members[0]->marker, *trajectory.marker)) return false;
    for (Run const& run : trajectory.runs) {
      auto const next = chain.runs.upper_bound({run.clip, run.start});
      if (next != chain.runs.end() && next->first.first == run.clip && !follows(run, *next->second))
        return false;
      if (next == chain.runs.begin()) continue;
      auto const previous = std::prev(next);
      if (previous->first.first == run.clip && !follows(*previous->second, run)) return false;
    }
    return true;
  }

  // The trajectories in as few chains as can be.
  std::vector<Chain> chains(std::vector<Trajectory> const& trajectories) {
    std::vector<Trajectory const*> single, several;
    NLEClip const* clip = trajectories.empty() ? nullptr : trajectories[0].runs[0].clip;
    for (Trajectory const& each : trajectories)
      (each.runs.size() == 1 && each.runs[0].clip == clip ? single : several).push_back(&each);
    auto const earlier = [](Trajectory const* a, Trajectory const* b) { return a->start() < b->start(); };
    std::stable_sort(single.begin(), single.end(), earlier);
    std::stable_sort(several.begin(), several.end(), earlier);

    std::vector<Chain> chains = chainsOfRuns(single);
    for (Trajectory const* each : several) {
      auto const found =
          std::find_if(chains.begin(), chains.end(), [&](Chain const& chain) { return fits(chain, *each); });
      (found == chains.end() ? chains.emplace_back() : *found).add(*each);
    }
    return chains;
  }

 private:
  static bool isSameSpace(Marker const& a, Marker const& b) {
    return a.getParent() == b.getParent() && a.getPreTranslation() == b.getPreTranslation() &&
           a.getPreRotation() == b.getPreRotation() &&
           a.getTranslationChannel()->getInterpolation() == b.getTranslationChannel()->getInterpolation();
  }

  // The fewest chains that cover the runs, which are sorted by start: all of them less the largest number of
  // pairs (run, the one that follows it) in which each run has one follower at most. Without a minimum
  // distance every run that has ended long enough serves equally well, so the first free one does.
  std::vector<Chain> chainsOfRuns(std::vector<Trajectory const*> const& all) {
    m_runs = &all;
    m_follower.assign(all.size(), kNone);
    m_previous.assign(all.size(), kNone);
    m_tried.assign(all.size(), kNone);
    std::vector<size_t> ends;  // of chains
    for (size_t i = 0; i < all.size(); ++i) {
      auto const end = std::find_if(ends.begin(), ends.end(), [&](size_t e) { return mayFollow(e, i); });
      if (end != ends.end()) {
        link(*end, i);
        *end = i;
      } else if (!(m_minimumDistance > 0 && findPrevious(i, i))) {
        ends.push_back(i);
      } else {
        // The runs that ended chains may be others now.
        ends.clear();
        for (size_t k = 0; k <= i; ++k)
          if (m_follower[k] == kNone) ends.push_back(k);
      }
    }
    std::vector<Chain> chains;
    for (size_t i = 0; i < all.size(); ++i) {
      if (m_previous[i] != kNone) continue;
      Chain& chain = chains.emplace_back();
      for (size_t k = i; k != kNone; k = m_follower[k]) chain.add(*all[k]);
    }
    return chains;
  }

  bool mayFollow(size_t earlier, size_t later) const {
    Trajectory const &a = *(*m_runs)[earlier], &b = *(*m_runs)[later];
    return follows(a.runs[0], b.runs[0]) && isSameSpace(*a.marker, *b.marker);
  }
  void link(size_t earlier, size_t later) {
    m_follower[earlier] = later;
    m_previous[later] = earlier;
  }
  // A run that `later` can follow, whose present follower finds another one: an augmenting path of the
  // matching.
  bool findPrevious(size_t later, size_t round) {
    for (size_t i = 0; i < later && m_work < kMostWork; ++i) {
      ++m_work;
      if (m_tried[i] == round || !mayFollow(i, later)) continue;
      m_tried[i] = round;
      if (m_follower[i] != kNone && !findPrevious(m_follower[i], round)) continue;
      link(i, later);
      return true;
    }
    return false;
  }

  static constexpr size_t kNone = SIZE_MAX;
  static constexpr int64 kMostWork = 50'000'000;  // pairs looked at: a second

  int m_minimumGap;
  double m_minimumDistance;
  std::vector<Trajectory const*> const* m_runs = nullptr;
  std::vector<size_t> m_follower, m_previous, m_tried;
  int64 m_work = 0;
};

// Why a marker's keys cannot be moved to another marker or parted; empty: they can.
char const* obstacleTo(Marker const& marker) {
  if (marker.getNumChildren() > 0) return "other modules stand below it";
  for (Controller const* channel : {static_cast<Controller const*>(marker.getRotationChannel()),
                                    static_cast<Controller const*>(marker.getScaleChannel())}) {
    bool keyed = false;
    channel->forEachTrack([&](NLEClip*, int, KeyTrack const& track) { keyed = keyed || !track.empty(); });
    if (keyed) return "its rotation or scale is keyed";
  }
  char const* reason = "";
  for (int i = 0; i < marker.getNumChannels(); ++i) {
    Controller const& channel = *marker.getChannel(i);
    channel.forEachTrack([&](NLEClip const* clip, int layer, KeyTrack const& track) {
      if (track.empty() || *reason) return;
      Obstacle const obstacle = obstacleToKeys(channel, clip, layer);
      reason = layer > 0 ? "it has keys in an upper layer" : reasonOf(obstacle);
    });
  }
  return reason;
}

// The keys of `from` that the channel is given besides its own.
void moveKeys(Controller& channel, Controller const& from) {
  DataEdit const edit(channel);
  from.forEachTrack([&](NLEClip* clip, int layer, KeyTrack const& track) {
    if (track.empty()) return;
    KeyTrack const* own = channel.findTrack(clip, layer);
    KeyTrack all = own ? *own : KeyTrack(track.shape());
    track.forEach(0, track.count(), [&](KeyTrack::Key const& key) { all.restore(key); });
    channel.setTrack(clip, layer, std::move(all));
  });
}

void absorb(Marker& marker, Marker& other) {
  for (int i = 0; i < other.getNumChannels(); ++i) {
    Controller const& from = *other.getChannel(i);
    if (Controller* channel = marker.addChannel(from.getName(), from.getPropertyType()))
      moveKeys(*channel, from);
  }
  marker.getDatabase()->removeFromScene(&other, true, true, true, true);
}

KeyTrack part(KeyTrack const& track, int64 first, int64 last) {
  KeyTrack result = track;
  if (first > -kForever) result.eraseRange(-kForever, first - 1);
  if (last < kForever) result.eraseRange(last + 1, kForever);
  return result;
}

// Another marker of the same kind and place, without keys.
Marker* sibling(Marker& marker) {
  Database& scene = *marker.getDatabase();
  auto* made = static_cast<Marker*>(
      scene.createModule(&Marker::staticClass(), marker.getName().GetStr(), marker.getParent()));
  made->setPreTranslation(marker.getPreTranslation());
  made->setPreRotation(marker.getPreRotation(), false);
  made->setRotationOrder(marker.getRotationOrder());
  for (int i = 0; i < marker.getNumChannels(); ++i) {
    Controller const& from = *marker.getChannel(i);
    Controller* channel = made->addChannel(from.getName(), from.getPropertyType());
    if (!channel) continue;
    DataEdit const edit = DataEdit::ofDefault(*channel);
    channel->setDefaultValues(from.getDefaultValues());
    channel->setInterpType(static_cast<int>(from.getInterpolation()));
  }
  return made;
}

// Gives `other` the keys of a clip from first to last, of upper layers all, and takes those of the lowest
// layer from the marker.
void giveKeys(Marker& marker, Marker& other, NLEClip* clip, int64 first, int64 last) {
  for (int i = 0; i < marker.getNumChannels(); ++i) {
    Controller& from = *marker.getChannel(i);
    Controller* channel = other.getProperty(from.getName());
    if (!channel) continue;
    DataEdit const edit(*channel), ownEdit(from);
    KeyTrack const* data = from.findDataTrack(clip);
    bool const whole = &from == marker.getRotationChannel() || &from == marker.getScaleChannel();
    for (int layer = 0; layer < clip->getNumLayers(); ++layer) {
      KeyTrack const* track = from.findTrack(clip, layer);
      if (!track || track->empty()) continue;
      bool const all = whole || track != data;
      channel->setTrack(clip, layer, all ? *track : part(*track, first, last));
      if (all) continue;
      KeyTrack rest = *track;
      rest.eraseRange(first, last);
      from.setTrack(clip, layer, std::move(rest));
    }
  }
}

}  // namespace

int MarkerPacker::pack(Marker* target) {
  std::vector<Trajectory> trajectories;
  trajectories.reserve(static_cast<size_t>(m_markers.getCount()) + 1);
  auto const add = [&](Marker* marker) {
    if (char const* reason = obstacleTo(*marker); *reason)
      marker->getDatabase()->logWarning("%s was not packed: %s", marker->getName().GetStr(), reason);
    else
      trajectories.push_back({marker, runsOf(*marker)});
    return trajectories.size();
  };
  if (target && add(target) == 0) return 0;
  for (int i = 0; i < m_markers.getCount(); ++i)
    if (m_markers[i] != target) add(m_markers[i]);
  // A marker that was never seen is no trajectory.
  auto const known = trajectories.begin() + (target ? 1 : 0);
  trajectories.erase(
      std::remove_if(known, trajectories.end(), [](Trajectory const& t) { return t.runs.empty(); }),
      trajectories.end());

  Packing packing(m_minimumGap, m_minimumDistance);
  std::vector<Chain> chains;
  if (!target) {
    chains = packing.chains(trajectories);
  } else {
    // Those that end first leave most room for others.
    chains.emplace_back().add(trajectories[0]);
    std::stable_sort(
        trajectories.begin() + 1, trajectories.end(),
        [](Trajectory const& a, Trajectory const& b) { return a.runs.back().end < b.runs.back().end; });
    for (size_t i = 1; i < trajectories.size(); ++i)
      if (packing.fits(chains[0], trajectories[i])) chains[0].add(trajectories[i]);
  }
  int packed = 0;
  for (Chain const& chain : chains)
    for (size_t i = 1; i < chain.members.size(); ++i, ++packed)
      absorb(*chain.members[0]->marker, *chain.members[i]->marker);
  return packed;
}

int MarkerPacker::unpack() {
  int split = 0;
  for (int i = 0; i < m_markers.getCount(); ++i) {
    Marker& marker = *m_markers[i];
    NLEClip* clip = marker.getDatabase()->getActiveClip();
    if (!clip || !clip->holdsKeys()) continue;
    std::vector<Run> const runs = runsOf(marker, clip);
    if (runs.size() < 2) continue;
    if (Obstacle const obstacle = obstacleToKeys(*marker.getTranslationChannel(), clip, 0);
        obstacle != Obstacle::none) {
      marker.getDatabase()->logWarning("%s was not unpacked: %s", marker.getName().GetStr(),
                                       reasonOf(obstacle));
      continue;
    }
    // From the last on, so that each takes what is left after its first frame.
    std::vector<Marker*> made;
    for (size_t k = 1; k < runs.size(); ++k) made.push_back(sibling(marker));
    for (size_t k = runs.size() - 1; k > 0; --k)
      giveKeys(marker, *made[k - 1], clip, runs[k].start, kForever);
    ++split;
  }
  return split;
}
