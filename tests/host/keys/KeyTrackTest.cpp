// What key tracks cost and share, and the forms of their leaves.
#include <algorithm>
#include <cmath>
#include <cstring>
#include <gtest/gtest.h>
#include <initializer_list>
#include <random>
#include <vector>

#include "host/keys/KeyTrack.h"

namespace {

using Key = KeyTrack::Key;
using Shape = KeyTrack::Shape;
using Values = KeyTrack::Values;

constexpr int64 kKeys = 20'000;
constexpr int64 kFramePeriod = 5'880'000;

double bytesPerKey(KeyTrack const& track) {
  return static_cast<double>(track.memoryUse()) / static_cast<double>(track.count());
}

std::vector<double> randomDoubles(int64 n) {
  std::mt19937_64 random(3);
  std::vector<double> values(static_cast<size_t>(n));
  for (double& v : values) v = std::uniform_real_distribution<double>(-2000, 2000)(random);
  return values;
}

Values valuesOf(std::vector<double> const& flat, int64 i) {
  double const* v = flat.data() + i * 3;
  return {v[0], v[1], v[2]};
}

KeyTrack denseTrack(std::vector<double> const& flat) {
  KeyTrack track(Shape::Vector);
  track.append(0, kFramePeriod, flat.data(), static_cast<int64>(flat.size()) / 3);
  return track;
}

TEST(KeyTrack, DenseKeysAreCompactHoweverTheyCome) {
  std::vector<double> const flat = randomDoubles(kKeys * 3);
  KeyTrack const bulk = denseTrack(flat);
  KeyTrack forward(Shape::Vector), backward(Shape::Vector), pieces(Shape::Vector);
  for (int64 i = 0; i < kKeys; ++i) forward.set(i * kFramePeriod, valuesOf(flat, i));
  for (int64 i = kKeys - 1; i >= 0; --i) backward.set(i * kFramePeriod, valuesOf(flat, i));
  for (int64 i = 0, n = 1; i < kKeys; i += n, n = std::min<int64>(n * 2 % 1001, kKeys - i))
    pieces.append(i * kFramePeriod, kFramePeriod, flat.data() + i * 3, n);

  for (KeyTrack const* track : std::initializer_list<KeyTrack const*>{&bulk, &forward, &backward, &pieces}) {
    EXPECT_STREQ(track->checkInvariants(), "");
    EXPECT_LE(bytesPerKey(*track), 26);
    EXPECT_TRUE(*track == bulk);
  }
}

TEST(KeyTrack, FloatsAndRepeatedValuesTakeLess) {
  std::vector<double> floats = randomDoubles(kKeys * 3);
  for (double& v : floats) v = static_cast<double>(static_cast<float>(v));
  EXPECT_LE(bytesPerKey(denseTrack(floats)), 14);
  EXPECT_LE(bytesPerKey(denseTrack(std::vector<double>(kKeys * 3, 0.1))), 2);

  // Nothing is lost: signed zeros, not-a-numbers, and doubles just beside a float.
  std::vector<double> const odd = {0.0, -0.0, NAN, 1e-310, 1e300, 0.1, -0.0, 0.0, 1.5, INFINITY, 16777217, 2};
  KeyTrack const track = denseTrack(odd);
  for (int64 i = 0; i < track.count(); ++i) {
    Values const got = track.at(i).values, expected = valuesOf(odd, i);
    EXPECT_EQ(std::memcmp(got.data(), expected.data(), sizeof got), 0) << i;
  }
}

TEST(KeyTrack, AnEditThatIsTakenBackLeavesNoTrace) {
  std::vector<double> const flat = randomDoubles(kKeys * 3);
  KeyTrack const before = denseTrack(flat);
  KeyTrack track = before;
  for (int64 i = 5; i < kKeys; i += 97) {
    track.erase(i);
    track.set(i * kFramePeriod, valuesOf(flat, i));
  }
  EXPECT_LE(bytesPerKey(track), 26);
  EXPECT_EQ(track.select(0, kKeys * kFramePeriod), kKeys);
  EXPECT_GE(bytesPerKey(track), 25.5);
  EXPECT_EQ(track.deselect(0, kKeys * kFramePeriod), kKeys);
  EXPECT_TRUE(track == before);
  EXPECT_FALSE(track.sharesAll(before));
  EXPECT_LE(bytesPerKey(track), 26);
  EXPECT_STREQ(track.checkInvariants(), "");
}

TEST(KeyTrack, SnapshotsShareUntilOneChanges) {
  std::vector<double> const flat = randomDoubles(kKeys * 3);
  KeyTrack track = denseTrack(flat);
  KeyTrack snapshot = track;
  EXPECT_TRUE(snapshot.sharesAll(track));
  EXPECT_EQ(track.erase(kKeys, KeyTrack::kAll), 0);  // changes nothing
  EXPECT_EQ(track.eraseRange(kKeys * kFramePeriod, INT64_MAX), 0);
  EXPECT_EQ(track.deselect(0, INT64_MAX), 0);
  EXPECT_TRUE(snapshot.sharesAll(track));

  track.set(0, {1, 2, 3}, 2);
  EXPECT_FALSE(snapshot.sharesAll(track));
  EXPECT_EQ(snapshot.at(0).values, valuesOf(flat, 0));
  EXPECT_EQ(track.at(0).values[1], 2);
  EXPECT_EQ(track.at(0).values[0], flat[0]);

  KeyTrack const moved = std::move(track);
  snapshot.clear();
  EXPECT_TRUE(snapshot.empty());
  EXPECT_EQ(moved.count(), kKeys);
  EXPECT_STREQ(moved.checkInvariants(), "");
}

TEST(KeyTrack, AMillionKeysDeletedOneByOne) {
  constexpr int64 kMany = 1'000'000;
  KeyTrack full(Shape::Scalar);
  std::vector<double> const values = randomDoubles(kMany);
  full.append(0, 7, values.data(), kMany);
  std::mt19937_64 random(9);

  for (int way = 0; way < 3; ++way) {
    KeyTrack track = full;
    int64 const mostMemory = track.memoryUse() + track.memoryUse() / 4;
    for (int64 left = kMany; left > 100; --left) {
      int64 const any = static_cast<int64>(random() % static_cast<uint64>(left));
      ASSERT_EQ(track.erase(way == 0 ? 0 : way == 1 ? left - 1 : any), 1);
      if (left % 250'000 == 0) {
        ASSERT_STREQ(track.checkInvariants(), "");
        // Evenly thinned out, times need room of their own.
        ASSERT_LE(track.memoryUse(), way == 2 ? 3 * mostMemory : mostMemory);
      }
    }
    EXPECT_EQ(track.count(), 100);
    EXPECT_LE(track.memoryUse(), 40'000);
    int64 const first = way == 0 ? kMany - 100 : 0;
    for (int64 i = 0; way < 2 && i < 100; ++i) {
      ASSERT_EQ(track.timeAt(i), (first + i) * 7);
      ASSERT_EQ(track.at(i).values[0], values[static_cast<size_t>(first + i)]);
    }
  }
  EXPECT_EQ(full.count(), kMany);
}

TEST(KeyTrack, ComparesKeysFlagsAndSelection) {
  KeyTrack a(Shape::Vector), b(Shape::Vector);
  for (int64 const t : {3, 1, 2}) a.set(t, {1, 2, 3});
  for (int64 const t : {1, 2, 3}) b.set(t, {1, 2, 3});
  EXPECT_TRUE(a == b);
  a.setSelected(1, 2);
  EXPECT_FALSE(a == b);
  b.setSelected(1, 2);
  EXPECT_TRUE(a == b);
  b.erase(2, 4);
  EXPECT_FALSE(a == b);
  EXPECT_FALSE(KeyTrack(Shape::Vector) == KeyTrack(Shape::Scalar));
}

}  // namespace
