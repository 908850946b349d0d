// Random edits of key tracks against the plain model, in trees of every depth.
#include <cstdlib>
#include <gtest/gtest.h>
#include <new>
#include <random>
#include <sstream>
#include <string>
#include <utility>
#include <vector>

#include "host/keys/DataRanges.h"
#include "tests/host/keys/KeyTrackModel.h"

// Allocations that succeed before one fails; none fails when it is negative.
static thread_local long s_allocationsLeft = -1;

[[gnu::noinline]] void* operator new(size_t size) {
  void* block = s_allocationsLeft >= 0 && s_allocationsLeft-- == 0 ? nullptr : std::malloc(size ? size : 1);
  return block ? block : throw std::bad_alloc();
}
[[gnu::noinline]] void* operator new(size_t size, std::nothrow_t const&) noexcept {
  return std::malloc(size ? size : 1);
}
[[gnu::noinline]] void operator delete(void* block) noexcept { std::free(block); }
[[gnu::noinline]] void operator delete(void* block, size_t) noexcept { std::free(block); }

namespace {

using Key = KeyTrack::Key;
using Shape = KeyTrack::Shape;
using Values = KeyTrack::Values;

constexpr int64 kFrame = 3;
constexpr KeyTrack::BridgeEnds kBridgeEnds{Interpolation::Linear, kFrame};

// Says what differs first, "" when nothing does.
std::string difference(KeyTrack const& track, KeyTrackModel const& model) {
  std::ostringstream text;
  if (*track.checkInvariants()) return track.checkInvariants();
  if (track.count() != model.size()) {
    text << "count " << track.count() << ", expected " << model.size();
    return text.str();
  }
  int64 i = 0;
  track.forEach(0, track.count(), [&](Key const& key) {
    Key const& expected = model.at(i++);
    if (key.time != expected.time || key.values != expected.values || key.components != expected.components ||
        key.selected != expected.selected || key.bridges != expected.bridges)
      text << "key " << i - 1 << " at " << key.time << " differs; ";
  });
  return text.str();
}

struct Setup {
  Shape shape;
  KeyTrack::Limits limits;
  int steps;
  int64 span;  // times are 0 to span
  unsigned seed;
};

void PrintTo(Setup const& setup, std::ostream* out) {
  *out << "width " << static_cast<int>(setup.shape) << ", " << setup.limits.leafKeys
       << " keys in a leaf, fanout " << setup.limits.fanout << ", seed " << setup.seed;
}

class KeyTrackEdits : public testing::TestWithParam<Setup> {
 protected:
  KeyTrackEdits()
      : track(GetParam().shape, GetParam().limits), model(GetParam().shape), random(GetParam().seed) {}

  int64 upTo(int64 n) { return std::uniform_int_distribution<int64>(0, n)(random); }
  bool oneIn(int n) { return upTo(n - 1) == 0; }
  int64 time() { return upTo(GetParam().span); }
  unsigned mask() { return oneIn(2) ? 7u : static_cast<unsigned>(upTo(7)); }

  // Mixes values that repeat, that floats hold, and that only doubles hold.
  Values values() {
    Values v{};
    int64 const kind = upTo(3);
    for (size_t c = 0; c < static_cast<size_t>(GetParam().shape); ++c)
      v[c] = kind < 2    ? 2.5
             : kind == 2 ? static_cast<double>(upTo(1000)) / 8
                         : static_cast<double>(upTo(1000)) / 7;
    return v;
  }

  void setOne(int64 at) {
    Values const v = values();
    unsigned const m = mask();
    track.set(at, v, m);
    model.set(at, v, m);
  }

  void appendRun() {
    int64 const n = upTo(GetParam().limits.leafKeys * 3), period = 1 + upTo(3);
    int64 const start = (model.keys.empty() ? 0 : model.keys.back().time) + 1 + upTo(4);
    std::vector<double> flat;
    for (int64 i = 0; i < n; ++i) {
      Values const v = values();
      flat.insert(flat.end(), v.begin(), v.begin() + track.width());
      model.set(start + i * period, v, 7);
    }
    track.append(start, period, flat.data(), n);
  }

  void eraseOne() {
    if (model.keys.empty()) return;
    int64 const i = oneIn(3) ? 0 : oneIn(3) ? model.size() - 1 : upTo(model.size() - 1), t = model.at(i).time;
    unsigned const m = mask();
    ASSERT_EQ(track.erase(i, m), model.eraseRange(t, t, m));
  }

  void changeRange() {
    int64 const first = time(), last = first + (oneIn(12) ? GetParam().span : upTo(GetParam().span / 24));
    unsigned const m = mask();
    switch (upTo(11)) {
      case 0:
        ASSERT_EQ(track.eraseRange(first, last, m), model.eraseRange(first, last, m));
        break;
      case 1:
        track.deselect(last, INT64_MAX, 7);  // else it would soon erase everything
        model.deselect(last, INT64_MAX, 7);
        track.deselect(0, first, 7);
        model.deselect(0, first, 7);
        return deleteSelected(m);
      case 2:
      case 3:
      case 4:
        ASSERT_EQ(track.select(first, last, m), model.select(first, last, m));
        break;
      case 5:
      case 6:
      case 7:
        ASSERT_EQ(track.deselect(first, last, m), model.deselect(first, last, m));
        break;
      case 8:
        return deleteRange(first, first + upTo(7), m);
      case 9:
      case 10: {
        bool const on = !oneIn(4);
        on ? track.bridge(first, last, m) : track.unbridge(first, last, m);
        model.bridge(first, last, m, on);
        break;
      }
      default:
        track.transform([](double* v) { v[0] = -v[0]; });
        for (Key& key : model.keys)
          if (key.components == 7) key.values[0] = -key.values[0];
    }
  }

  // Edits of data: the frames of `gone` lose it and no others, and keys that come lie on the curve as it was.
  template <class Gone>
  void compareData(Gone gone) {
    ASSERT_STREQ(track.checkInvariants(), "");
    KeyTrackModel const before = model;
    KeyTrack const curve = std::exchange(m_before, KeyTrack(GetParam().shape));
    model.keys.clear();
    track.forEach(0, track.count(), [&](Key const& key) { model.keys.push_back(key); });
    int64 const end = before.keys.empty() ? -1 : before.keys.back().time;
    std::vector<unsigned> const had = before.dataAt(0, end, kFrame), has = model.dataAt(0, end, kFrame);
    for (size_t i = 0; i < had.size(); ++i)
      if (had[i] != has[i] || oneIn(8)) {
        int64 const t = static_cast<int64>(i) * kFrame;
        ASSERT_EQ(has[i], had[i] & ~gone(before, t)) << "at " << t;
      }
    for (Key const& key : model.keys) {
      int64 const old = before.find(key.time);
      unsigned const added = key.components & ~(old < 0 ? 0u : before.at(old).components);
      ASSERT_TRUE(added == 0 || key.time % kFrame == 0);
      Values expected{};
      curve.evaluate(key.time, kBridgeEnds.interpolation, {}, expected);
      for (size_t c = 0; c < static_cast<size_t>(GetParam().shape); ++c)
        if (GetParam().shape != Shape::Vector || key.components >> c & 1) {
          ASSERT_NEAR(key.values[c], expected[c], 1e-9);
        }
    }
  }

  void deleteRange(int64 first, int64 last, unsigned mask) {
    KeyTrackModel erased = model;
    m_before = track;
    ASSERT_EQ(track.deleteRange(first, last, mask, kBridgeEnds), erased.eraseRange(first, last, mask));
    compareData([&](KeyTrackModel const& before, int64 t) {
      return t >= first && t <= last ? before.normal(mask) : 0;
    });
  }

  void deleteSelected(unsigned mask) {
    KeyTrackModel erased = model;
    m_before = track;
    ASSERT_EQ(track.deleteSelected(mask, kBridgeEnds), erased.eraseSelected(mask));
    compareData([&](KeyTrackModel const& before, int64 t) {
      unsigned lost = 0;
      for (unsigned c = 1; c < 8; c *= 2) {
        int64 const next = before.nextHolder(before.lowerBound(t) - 1, c);
        int64 const last = before.walk(before.lowerBound(t + 1), -1, &Key::components, c);
        auto const chosen = [&](int64 i) {
          return i >= 0 && (before.at(i).selected & c & before.normal(mask)) != 0;
        };
        if (chosen(next) && chosen(last)) lost |= c;
      }
      return lost;
    });
  }

  void thin() {
    std::vector<unsigned char> lost(model.keys.size());
    bool const much = oneIn(2);
    for (unsigned char& each : lost)
      if (oneIn(much ? 3 : 40)) each = static_cast<unsigned char>(model.normal(mask()));
    for (unsigned c = 1; c < 8; c *= 2)
      if (int64 const last = model.walk(model.size(), -1, &Key::components, c); last >= 0)
        lost[static_cast<size_t>(last)] = 0;
    ASSERT_EQ(track.thin(lost), model.thin(lost));
  }

  void restoreOne() {
    if (model.keys.empty()) return;
    Key& key = model.at(upTo(model.size() - 1));
    track.restoreNone(key.time);
    Values const fresh = values();
    for (size_t c = 0; c < static_cast<size_t>(GetParam().shape); ++c)
      if (GetParam().shape != Shape::Vector || key.components >> c & 1) key.values[c] = fresh[c];
    key.selected = key.components;
    track.restore(key);
  }

  void setSelected() {
    if (model.keys.empty()) return;
    int64 const i = upTo(model.size() - 1);
    unsigned const flags = mask();
    track.setSelected(i, flags);
    model.at(i).selected = static_cast<unsigned char>(model.normal(flags) & model.at(i).components);
  }

  void step() {
    int64 const what = upTo(99);
    bool const large = model.size() > GetParam().span / 2;
    if (what < 40) {
      setOne(time());
    } else if (what < 45 && !large) {
      int64 const start = time();  // a row of neighbours, as recording over a stretch writes them
      for (int64 i = upTo(20); i >= 0; --i) setOne(start + i);
    } else if (what < 47 && !large) {
      appendRun();
    } else if (what < 70) {
      for (int64 i = large ? 20 : 0; i >= 0; --i) eraseOne();
    } else if (what < 72) {
      oneIn(8) ? thin() : restoreOne();
    } else if (what < 85) {
      setSelected();
    } else {
      changeRange();
    }
  }

  void compareRanges() {
    unsigned const mask = 1 + static_cast<unsigned>(upTo(6));
    bool const all = oneIn(2);
    DataRanges const ranges(track, kFrame, mask, all ? DataRanges::Where::All : DataRanges::Where::Any);
    int64 const first = time() - 7, last = first + upTo(GetParam().span / 2);
    unsigned const wanted = model.normal(mask);
    // With room for the runs that reach beyond the range.
    int64 const from = -10 * kFrame, to = GetParam().span * 3 + 100;
    std::vector<unsigned> const data = model.dataAt(from, to, kFrame);
    auto const hasData = [&](int64 frameTime) {
      if (frameTime < from || frameTime > to) return false;
      unsigned const here = data[static_cast<size_t>((frameTime - from) / kFrame)] & wanted;
      return all ? here == wanted : here != 0;
    };
    std::vector<int64> seen, missing, expectedSeen, expectedMissing;
    auto const collectInto = [](std::vector<int64>& into) {
      return [&into](int64 start, int64 end) {
        ASSERT_TRUE(into.empty() || start > into.back() + kFrame) << "runs that touch";
        for (; start <= end; start += kFrame) into.push_back(start);
      };
    };
    ranges.visitRanges(first, last, collectInto(seen));
    ranges.visitGaps(first, last, collectInto(missing));
    for (int64 t = frameAtOrAfter(first, kFrame) * kFrame; t <= last; t += kFrame)
      (hasData(t) ? expectedSeen : expectedMissing).push_back(t);
    ASSERT_EQ(seen, expectedSeen) << "components " << wanted;
    ASSERT_EQ(missing, expectedMissing);
    unsigned const any = model.dataAt(first, first, 1).front() & wanted;
    ASSERT_EQ(ranges.hasDataAt(first), all ? any == wanted : any != 0);
    HTimeRange const gap = ranges.nextGap(first, last), range = ranges.nextRange(first, last);
    ASSERT_EQ(gap.isEmpty(), missing.empty());
    ASSERT_EQ(range.isEmpty(), seen.empty());
    ASSERT_TRUE(gap.isEmpty() || (gap.getStart() == missing.front() && !hasData(gap.getEnd())));
    if (range.isEmpty()) return;
    ASSERT_EQ(range.getStart(), seen.front());
    ASSERT_TRUE(range.getEnd() == seen.back() || !hasData(range.getEnd() + kFrame));
    HTimeRange around(seen.back(), seen.back());
    while (hasData(around.getStart() - kFrame)) around.setEnds(around.getStart() - kFrame, around.getEnd());
    while (hasData(around.getEnd() + kFrame)) around.setEnds(around.getStart(), around.getEnd() + kFrame);
    ASSERT_EQ(ranges.rangeAround(seen.back()), around);
  }

  void compareQueries() {
    ASSERT_EQ(track.countSelected(), model.countSelected(7));
    for (unsigned m = 0; m < 8; ++m) {
      ASSERT_EQ(track.countHolding(m), model.countHolding(m)) << m;
      ASSERT_EQ(track.countSelected(m), model.countSelected(m)) << m;
      int64 const i = upTo(model.size() + 3) - 2;
      ASSERT_EQ(track.nextHolding(i, m), model.walk(i, 1, &Key::components, m)) << i << " " << m;
      ASSERT_EQ(track.nextSelected(i, m), model.walk(i, 1, &Key::selected, m)) << i << " " << m;
      ASSERT_EQ(track.previousHolding(i, m), model.walk(i, -1, &Key::components, m)) << i << " " << m;
      ASSERT_EQ(track.previousSelected(i, m), model.walk(i, -1, &Key::selected, m)) << i << " " << m;
      ASSERT_EQ(track.nextUnselected(i, m), model.walk(i, 1, &Key::selected, m, false)) << i << " " << m;
      ASSERT_EQ(track.previousUnselected(i, m), model.walk(i, -1, &Key::selected, m, false)) << i << " " << m;
    }
    for (int n = 0; n < 4; ++n) {
      int64 const t = time() - 2;
      ASSERT_EQ(track.find(t), model.find(t));
      ASSERT_EQ(track.lowerBound(t), model.lowerBound(t));
    }
    int64 index = -1;
    for (int64 n = 0; n < track.countSelected(); ++n) {
      index = model.walk(index, 1, &Key::selected, 7);
      if (oneIn(8)) {
        ASSERT_EQ(track.selectedIndex(n), index);
      }
    }
    if (model.keys.empty()) return;
    int64 const i = upTo(model.size() - 1);
    int64 k = i;
    track.forEach(i, std::min(i + 20, model.size()),
                  [&](Key const& key) { ASSERT_EQ(key.time, model.at(k++).time); });
    ASSERT_EQ(track.timeAt(i), model.at(i).time);
    ASSERT_EQ(track.at(i).values, model.at(i).values);
  }

  KeyTrack track;
  KeyTrackModel model;
  std::mt19937 random;

 private:
  KeyTrack m_before{Shape::Scalar};
};

TEST_P(KeyTrackEdits, MatchThePlainModel) {
  std::vector<std::pair<KeyTrack, KeyTrackModel>> snapshots;
  for (int i = 0; i < GetParam().steps; ++i) {
    step();
    if (HasFatalFailure()) FAIL() << "at step " << i;
    if (i % 4 == 0) {
      ASSERT_EQ(difference(track, model), "") << "at step " << i;
    }
    if (i % 8 == 0) compareQueries();
    if (i % 16 == 0) compareRanges();
    if (HasFatalFailure()) FAIL() << "at step " << i;
    if (oneIn(GetParam().steps / 12)) snapshots.emplace_back(track, model);
    if (oneIn(GetParam().steps / 3)) {  // go on from a snapshot, as undo does
      track = snapshots.empty() ? KeyTrack(GetParam().shape, GetParam().limits) : snapshots.front().first;
      model = snapshots.empty() ? KeyTrackModel(GetParam().shape) : snapshots.front().second;
    }
  }
  ASSERT_FALSE(snapshots.empty());
  for (auto const& [snapshot, then] : snapshots) EXPECT_EQ(difference(snapshot, then), "");
}

// A set key is there or not; after other edits the tree is whole, and can be put back key by key as undo
// does.
TEST_P(KeyTrackEdits, SurviveAnyFailingAllocation) {
  for (int i = 0; i < GetParam().steps / 16; ++i) {
    step();
    int64 const what = upTo(8), first = time(), last = first + upTo(GetParam().span / 3);
    Values const v = values();
    unsigned const m = mask();
    std::vector<double> const flat(static_cast<size_t>(GetParam().limits.leafKeys * 2 * track.width()), 0.1);
    std::vector<unsigned char> lost(model.keys.size());
    for (size_t k = 1; k + 1 < lost.size(); k += 2) lost[k] = KeyTrack::kAll;
    auto const edit = [&] {
      if (what < 4) return track.set(first, v, m);
      if (what == 4) return track.append(GetParam().span * 4, 2, flat.data(), GetParam().limits.leafKeys * 2);
      if (what == 5) return static_cast<void>(track.deleteRange(first, last, m, kBridgeEnds));
      if (what == 6) return static_cast<void>(track.thin(lost));
      if (what == 7) return track.bridge(first, last, m);
      static_cast<void>(track.select(first, last, m));
    };
    bool failed = false;
    for (long n = 0; n == 0 || failed; ++n) {
      failed = false;
      s_allocationsLeft = n;
      try {
        edit();
      } catch (std::bad_alloc const&) {
        failed = true;
      }
      s_allocationsLeft = -1;
      std::string const broken = track.checkInvariants();
      ASSERT_TRUE(broken.empty() || broken.starts_with("the last key")) << broken << ", edit " << what;
      if (failed && what < 4) {
        ASSERT_EQ(difference(track, model), "") << "allocation " << n;
      }
      std::vector<int64> times;
      track.forEach(0, track.count(), [&](Key const& key) { times.push_back(key.time); });
      for (int64 const each : times) track.restoreNone(each);
      for (Key const& key : model.keys) track.restore(key);
      ASSERT_EQ(difference(track, model), "") << "put back, edit " << what;
    }
  }
}

INSTANTIATE_TEST_SUITE_P(Random, KeyTrackEdits,
                         testing::Values(Setup{Shape::Scalar, {4, 4}, 6000, 700, 1},
                                         Setup{Shape::Vector, {4, 4}, 9000, 700, 2},
                                         Setup{Shape::Rotation, {4, 4}, 4000, 700, 3},
                                         Setup{Shape::Vector, {5, 6}, 6000, 2000, 4},
                                         Setup{Shape::Vector, {16, 4}, 6000, 3000, 5},
                                         Setup{Shape::Scalar, {16, 5}, 4000, 3000, 6},
                                         Setup{Shape::Vector, {256, 32}, 3000, 12000, 7},
                                         Setup{Shape::Rotation, {256, 32}, 2000, 12000, 8}));

}  // namespace
