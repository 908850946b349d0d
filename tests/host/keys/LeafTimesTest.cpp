// Random edits of a leaf's times against a plain list, over distances that need each of the forms.
#include <algorithm>
#include <gtest/gtest.h>
#include <numeric>
#include <random>
#include <set>
#include <vector>

#include "host/keys/LeafTimes.h"

namespace {

class KeyTimesEdits : public testing::TestWithParam<int64> {
 protected:
  static constexpr int kLimit = 40;

  int upTo(int n) { return static_cast<int>(m_random() % static_cast<unsigned>(n + 1)); }
  // Mostly multiples of a unit, seldom just beside one.
  int64 time() { return (upTo(200) - 100) * GetParam() + (upTo(30) == 0 ? upTo(2) - 1 : 0); }
  int size() const { return static_cast<int>(m_expected.size()); }

  void edit() {
    int const what = upTo(9);
    if (what < 4 && size() < kLimit) {
      int64 const at = time();
      auto const place = std::lower_bound(m_expected.begin(), m_expected.end(), at);
      if (place != m_expected.end() && *place == at) return;
      m_times.insert(static_cast<int>(place - m_expected.begin()), at, kLimit);
      m_expected.insert(place, at);
    } else if (what == 4) {
      int64 const start = (size() > 0 ? m_expected.back() : 0) + (1 + upTo(2)) * GetParam();
      int const n = std::min(upTo(8), kLimit - size());
      if (n == 0 || start > 300 * GetParam()) return;
      m_times.append(start, GetParam() * 2, n, kLimit);
      for (int i = 0; i < n; ++i) m_expected.push_back(start + i * GetParam() * 2);
    } else if (what < 8 && size() > 0) {
      int const first = upTo(size() - 1), last = std::min(size(), first + 1 + (upTo(5) ? 0 : upTo(9)));
      m_times.erase(first, last);
      m_expected.erase(m_expected.begin() + first, m_expected.begin() + last);
    } else if (what == 8) {
      m_times.pack();
    } else if (size() > 1) {  // as leaves split and join
      int const middle = upTo(size());
      LeafTimes left, right;
      left.append(m_times, 0, middle);
      right.append(m_times, middle, size());
      left.append(right, 0, right.size());
      m_times = std::move(left);
    }
  }

  void compare() {
    ASSERT_EQ(m_times.size(), size());
    ASSERT_TRUE(m_times.isWhole());
    std::vector<int64> read(m_expected.size());
    m_times.read(0, size(), read.data());
    ASSERT_EQ(read, m_expected);
    for (int i = 0; i < size(); ++i) ASSERT_EQ(m_times[i], m_expected[static_cast<size_t>(i)]);
    if (m_expected.empty()) return;
    for (int i = 0; i < 4; ++i) {
      int64 const at = i < 2 ? time() : m_expected[static_cast<size_t>(upTo(size() - 1))] + i - 2;
      auto const before = std::lower_bound(m_expected.begin(), m_expected.end(), at) - m_expected.begin();
      auto const after = std::upper_bound(m_expected.begin(), m_expected.end(), at) - m_expected.begin();
      ASSERT_EQ(m_times.lowerBound(at), before);
      if (after > 0) {
        ASSERT_EQ(m_times.lastAtOrBefore(at), after - 1);
      }
    }
  }

  LeafTimes m_times;
  std::vector<int64> m_expected;
  std::mt19937 m_random{3};
};

TEST_P(KeyTimesEdits, MatchThePlainList) {
  std::set<int64> widths;  // bytes for a time
  int gaps = 0;
  for (int step = 0; step < 20'000; ++step) {
    if (step >= 10'000 && step % 100 == 0) {  // even times, in which edits make gaps
      m_times = LeafTimes();
      m_times.append(0, GetParam(), kLimit, kLimit);
      m_expected.clear();
      for (int i = 0; i < kLimit; ++i) m_expected.push_back(i * GetParam());
    }
    edit();
    compare();
    if (HasFatalFailure()) FAIL() << "step " << step;
    if (size() < 3) continue;
    LeafTimes packed = m_times;
    packed.pack();
    gaps += packed.bytes() > 0 && packed.bytes() < size() - 1;
    widths.insert(packed.bytes() / size());
    int64 const all = m_expected.back() - m_expected.front();
    int64 unit = 0;
    for (int64 const each : m_expected) unit = std::gcd(unit, each - m_expected.front());
    if (all / unit < size() + 255) {
      ASSERT_LE(packed.bytes(), size() + 1);
    }
    int64 const most = all <= 65'535 ? 2 : all <= 4'294'967'295 ? 4 : 8;
    ASSERT_LE(packed.bytes(), most * size());
  }
  EXPECT_GT(gaps, 100);
  EXPECT_GE(widths.size(), 2u);  // even, and another
}

INSTANTIATE_TEST_SUITE_P(Units, KeyTimesEdits, testing::Values(1, 7, 5'000, 5'880'000, int64{1} << 52));

}  // namespace
