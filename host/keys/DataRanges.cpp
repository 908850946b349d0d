#include "host/keys/DataRanges.h"

#include <algorithm>
#include <cassert>

#include "host/keys/KeyTrackPlace.h"

// Goes through the keys in order. Between two keys those components have data that are bridged by the last
// key that holds them; they are carried along, so that each key is looked at once. Frames are numbers here.
struct DataRanges::Scan {
  DataRanges const& ranges;
  int64 start, lastFrame;
  Emit emit;
  void* context;
  unsigned bridged = 0;              // over the time after the last key
  int64 nextFrame = 0;               // the first one after the last key
  int64 runFirst = 0, runLast = -1;  // frames with data that are not emitted yet
  bool stopped = false;

  Scan(DataRanges const& of, int64 first, int64 last, Emit to, void* with)
      : ranges(of),
        start(frameAtOrAfter(std::max(first, -kForever), of.m_period) * of.m_period),
        lastFrame(frameAtOrBefore(std::min(last, kForever), of.m_period)),
        emit(to),
        context(with),
        bridged(of.m_track.bridgedAt(start)),
        nextFrame(start / of.m_period) {}

  void flush() {
    if (runFirst <= runLast && !stopped)
      stopped = !emit(context, runFirst * ranges.m_period, runLast * ranges.m_period);
    runLast = runFirst - 1;
  }

  void add(int64 first, int64 last) {
    last = std::min(last, lastFrame);
    if (first > last) return;
    if (runFirst > runLast || first > runLast + 1) {
      flush();
      runFirst = first;
    }
    runLast = last;
  }

  // What lies between the last key and the key at this time.
  void reach(int64 time) {
    if (ranges.counts(bridged)) add(nextFrame, frameAtOrAfter(time, ranges.m_period) - 1);
    if (time > lastFrame * ranges.m_period) {
      flush();
      stopped = true;
    }
  }
  void pass(int64 time, unsigned bridgesAfter) {
    bridged = bridgesAfter;
    nextFrame = frameAtOrBefore(time, ranges.m_period) + 1;
  }

  void visit(KeyNode const& node) {
    if (stopped) return;
    if (node.counts.bridgesAll() && firstTimeOf(node) >= start) {
      int64 const first = firstTimeOf(node), last = lastTimeOf(node);
      reach(first);
      add(frameAtOrAfter(first, ranges.m_period), frameAtOrBefore(last, ranges.m_period));
      return pass(last, KeyTrack::kAll);
    }
    if (node.isLeaf()) return visitLeaf(asLeaf(node));
    auto const& inner = asInner(node);
    for (int i = inner.childAtTime(start); i < inner.size() && !stopped; ++i) visit(inner.child(i));
  }

  void visitLeaf(KeyLeaf const& leaf) {
    int64 const period = ranges.m_period, first = leaf.firstTime();
    bool const everyFrame = leaf.plain() && leaf.evenTimes() && first >= start && first % period == 0 &&
                            leaf.lastTime() - first == period * (leaf.size() - 1);
    if (everyFrame) {
      reach(first);
      add(first / period, leaf.lastTime() / period);
      return pass(leaf.lastTime(), 0);
    }
    constexpr int kDecoded = 32;
    int64 times[kDecoded];
    int const begin = leaf.lowerBound(start);
    for (int slot = begin; slot < leaf.size() && !stopped; ++slot) {
      int const i = (slot - begin) % kDecoded;
      if (i == 0) leaf.readTimes(slot, std::min(kDecoded, leaf.size() - slot), times);
      int64 const time = times[i];
      unsigned const held = leaf.components(slot);
      reach(time);
      if (time % period == 0 && ranges.counts(bridged | held)) add(time / period, time / period);
      pass(time, (bridged & ~held) | leaf.bridges(slot));
    }
  }
};

DataRanges::DataRanges(KeyTrack const& track, int64 framePeriod, unsigned mask, Where where)
    : m_track(track), m_period(framePeriod), m_mask(track.normal(mask)), m_where(where) {
  assert(framePeriod > 0 && m_mask != 0);
}

bool DataRanges::hasDataAt(int64 time) const {
  int64 const index = m_track.find(time);
  return counts(m_track.bridgedAt(time) | (index < 0 ? 0u : m_track.at(index).components));
}

void DataRanges::scan(int64 first, int64 last, Emit emit, void* context) const {
  if (m_track.empty() || first > last) return;
  Scan scan(*this, first, last, emit, context);
  scan.visit(*m_track.m_root.get());
  scan.flush();
}

HTimeRange DataRanges::nextRange(int64 first, int64 last) const {
  HTimeRange found;
  scan(
      first, last,
      [](void* range, int64 start, int64 end) {
        static_cast<HTimeRange*>(range)->setEnds(start, end);
        return false;
      },
      &found);
  return found;
}

HTimeRange DataRanges::nextGap(int64 first, int64 last) const {
  int64 const end = frameAtOrBefore(last, m_period) * m_period;
  int64 const start = frameAtOrAfter(first, m_period) * m_period;
  if (start > end) return {};
  HTimeRange const range = nextRange(start, end);
  if (range.isEmpty()) return {start, end};
  if (range.getStart() > start) return {start, range.getStart() - m_period};
  // Two runs of frames with data do not touch, so that after one there is a gap, or nothing.
  if (range.getEnd() == end) return {};
  HTimeRange const after = nextRange(range.getEnd() + m_period, end);
  return {range.getEnd() + m_period, after.isEmpty() ? end : after.getStart() - m_period};
}

// Backwards the keys are gone through in stretches that double, each forwards.
HTimeRange DataRanges::rangeAround(int64 frameTime) const {
  HTimeRange range = nextRange(frameTime, kForever);
  if (range.isEmpty() || range.getStart() != frameTime) return {};
  int64 const index = m_track.lowerBound(frameTime);
  for (int64 keys = 64;; keys *= 2) {
    int64 const from = std::max<int64>(index - keys, 0);
    int64 const time = m_track.timeAt(from);
    int64 start = frameTime;
    visitRanges(time, frameTime, [&](int64 runStart, int64) { start = runStart; });
    range.setEnds(start, range.getEnd());
    if (from == 0 || start > frameAtOrAfter(time, m_period) * m_period) return range;
  }
}

void DataRanges::bridge(KeyTrack& track, unsigned mask) const {
  visitRanges(-kForever, kForever, [&](int64 start, int64 end) {
    if (start < end) track.bridge(start, end - 1, mask);
  });
}

void DataRanges::bridgeAlike(KeyTrack& track, KeyTrack const& data) {
  for (unsigned const part : KeyParts(data.shape(), KeyTrack::kAll))
    if (data.bridgesAny(part)) DataRanges(data, 1, part).bridge(track, part);
}
