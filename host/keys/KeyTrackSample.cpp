// Sampling of the key track: its values at many times.
//
// The keys around a run of times are decoded from their leaf into a window of plain arrays; then one loop
// finds each time's span (the keys a and b around it) and how far it lies in that, and one loop for each
// component and interpolation makes the values. What belongs to a span alone is calculated once. Shorter ways
// serve times that are those of keys, leaves of one repeated value, and times so sparse that decoding would
// not pay.
#include <array>
#include <cmath>

#include "host/keys/KeyInterpolation.h"
#include "host/keys/KeyTrackPlace.h"
#include "host/keys/SampleTimes.h"

class KeyTrack::Sampler {
 public:
  // The curve of the keys that hold `holding`, which must not be none; components first to before end.
  Sampler(KeyTrack const& track, SampleTimes const& times, Interpolation kind, unsigned holding, int first,
          int end, double* out, ptrdiff_t stride)
      : m_track(track),
        m_times(times),
        m_kind(kind),
        m_holding(holding),
        m_firstComponent(first),
        m_endComponent(end),
        m_out(out),
        m_stride(stride) {}

  void run() {
    Place const first = m_track.placeAt(m_track.nextHolding(-1, m_holding));
    hold(first, m_times.lowerBound(first.time(), 0));
    if (done()) return;
    for (Place a = placeFor(first); !done(); a = placeFor(a))
      if (!takeKeys(a) && !takeRepeated(a)) takeChunk(a);
  }

 private:
  using Arc = interpolation::Arc;
  using CubicSpan = interpolation::CubicSpan;
  using SquadSpan = interpolation::SquadSpan;
  using Tangent = interpolation::Tangent;
  using Quat = interpolation::Quat;

  static constexpr int kChunk = 128;  // keys of a leaf, or samples, that are worked on at once
  static constexpr int kWindow = kChunk + 3;
  static constexpr int kFirst = 1;        // where keys begin in the window
  static constexpr int kSparse = 8;       // keys for a sample from which single evaluation is faster
  static constexpr double kUnit = 1e-14;  // how far a unit quaternion's square may be from 1

  bool done() const { return m_next == m_times.count(); }
  static size_t at(int i) { return static_cast<size_t>(i); }
  double* out(int64 i) const { return m_out + i * m_stride; }
  int width() const { return m_endComponent - m_firstComponent; }

  // The key at or before the next time; `known` is such a key.
  Place placeFor(Place const& known) const {
    if (done()) return known;
    int64 const time = m_times[m_next];
    int const slot = known.leaf->lastAtOrBefore(time, known.slot);
    Place place{known.leaf, known.index + slot - known.slot, slot};
    if (slot + 1 == known.leaf->size()) place = m_track.placeAtOrBefore(time);
    if (place.leaf->components(place.slot) & m_holding) return place;
    return m_track.neighbour(place, -1, m_holding, nullptr);
  }

  // The key's value up to the sample `end`.
  void hold(Place const& key, int64 end) {
    for (int c = m_firstComponent; c < m_endComponent; ++c) {
      double const value = key.value(c);
      for (int64 i = m_next; i < end; ++i) out(i)[c] = value;
    }
    m_next = std::max(m_next, end);
  }

  // The last key's value for all samples that are left.
  void holdRest() {
    for (int c = 0; c < width(); ++c)
      for (int64 i = m_next; i < m_times.count(); ++i) out(i)[m_firstComponent + c] = m_values[c][m_ending];
    m_next = m_times.count();
  }

  // Samples that are keys of the leaf, at each or each n-th of them.
  bool takeKeys(Place const& a) {
    KeyLeaf const& leaf = *a.leaf;
    int64 const own = leaf.period(), period = m_times.period();
    if (own == 0 || period % own != 0 || period == 0 || m_times[m_next] != a.time() ||
        !leaf.allHold(m_holding))
      return false;
    int64 const step = period / own, left = leaf.size() - a.slot;
    int64 const n = std::min((left - 1) / step + 1, m_times.count() - m_next);
    leaf.readValues(a.slot, n > 1 ? static_cast<int>(step) : 1, static_cast<int>(n), m_firstComponent,
                    m_endComponent, out(m_next) + m_firstComponent, m_stride);
    m_next += n;
    return true;
  }

  // Samples between keys of one value, whose neighbours have it too.
  bool takeRepeated(Place const& a) {
    KeyLeaf const& leaf = *a.leaf;
    if (!leaf.repeats() || !leaf.allHold(m_holding) || !staysBetweenKeys(a)) return false;
    int last = leaf.size() - 1;
    if (m_kind == Interpolation::Cubic) {
      if (!sameValue(a, m_track.neighbour(a, -1, m_holding, nullptr))) return false;
      Place const end{&leaf, a.index + last - a.slot, last};
      if (!sameValue(a, m_track.neighbour(end, 1, m_holding, nullptr))) --last;
    }
    if (last < a.slot || m_times[m_next] > leaf.time(last)) return false;
    hold(a, m_times.lowerBound(leaf.time(last) + 1, m_next));
    return true;
  }

  // Whether interpolation between equal values returns them: it makes rotations unit, and infinities no
  // numbers.
  bool staysBetweenKeys(Place const& key) const {
    double square = 0;
    for (int c = m_firstComponent; c < m_endComponent; ++c) square += key.value(c) * key.value(c);
    return m_track.shape() == Shape::Rotation ? std::abs(square - 1) <= kUnit : std::isfinite(square);
  }

  bool sameValue(Place const& a, Place const& b) const {
    if (!b) return true;
    for (int c = m_firstComponent; c < m_endComponent; ++c)
      if (a.value(c) != b.value(c)) return false;
    return true;
  }

  // The samples in the spans that start at some keys of the leaf. Makes `a` the key that those end at.
  void takeChunk(Place& a) {
    KeyLeaf const& leaf = *a.leaf;
    int64 const lastTime = m_times[m_times.count() - 1];
    int const end = std::min(lastTime >= leaf.lastTime() ? leaf.size() : leaf.lastAtOrBefore(lastTime) + 1,
                             a.slot + kChunk);
    int64 const inside = m_times.lowerBound(leaf.time(end - 1), m_next);
    if ((inside - m_next) * kSparse < end - a.slot - 1) return takeSingly(a, std::max(inside, m_next + 1));

    Place const next = fillWindow(a, end);
    int64 const until = m_times.lowerBound(m_keyTimes[m_ending], m_next);
    while (m_next < until) takeBatch(static_cast<int>(std::min<int64>(until - m_next, kChunk)));
    if (next) {
      a = next;
    } else {
      holdRest();
    }
  }

  void takeSingly(Place& a, int64 end) {
    Values values{};
    while (m_next < end) {
      a = placeFor(a);
      m_track.evaluateAt(m_times[m_next], m_kind, m_holding, a, values, values, nullptr);
      for (int c = m_firstComponent; c < m_endComponent; ++c) out(m_next)[c] = values[static_cast<size_t>(c)];
      ++m_next;
    }
  }

  // The window holds the key before `a` (for slopes), those from `a` to the slot `end`, and the next one
  // (two). Where there is none to take a slope from, any key does. Returns the first of these last, which may
  // be none.
  Place fillWindow(Place const& a, int end) {
    bool const cubic = m_kind == Interpolation::Cubic;
    Place before;
    if (cubic) {
      bool const follows = m_previous && m_previous.index + 1 == a.index &&
                           m_previous.leaf->components(m_previous.slot) & m_holding;
      before = follows ? m_previous : m_track.neighbour(a, -1, m_holding, nullptr);
    }
    m_size = kFirst;
    put(0, before ? before : a);
    m_span = kFirst;
    decode(*a.leaf, a.slot, end);

    m_previous = {a.leaf, a.index + end - 1 - a.slot, end - 1};
    Place const next = m_track.neighbour(m_previous, 1, m_holding, nullptr);
    if (next) put(m_size++, next);
    m_ending = m_size - 1;
    if (cubic) {
      Place const after = next ? m_track.neighbour(next, 1, m_holding, nullptr) : next;
      put(m_ending + 1, after ? after : a);
      prepareTangents(static_cast<bool>(before), static_cast<bool>(after));
    }
    return next;
  }

  void put(int i, Place const& key) {
    m_keyTimes[i] = key.time();
    for (int c = 0; c < width(); ++c) m_values[c][i] = key.value(m_firstComponent + c);
  }

  void decode(KeyLeaf const& leaf, int slot, int end) {
    if (!leaf.allHold(m_holding)) {
      for (; slot < end; ++slot)
        if (leaf.components(slot) & m_holding) put(m_size++, {&leaf, 0, slot});
      return;
    }
    leaf.readTimes(slot, end - slot, m_keyTimes + m_size);
    for (int c = 0; c < width(); ++c) {
      int const own = m_firstComponent + c;
      leaf.readValues(slot, 1, end - slot, own, own + 1, m_values[c] + m_size, 1);
    }
    m_size += end - slot;
  }

  // The weights of slopes at both ends of each span, which all components share.
  void prepareTangents(bool hasBefore, bool hasAfter) {
    double lengths[kWindow];
    for (int i = 0; i < m_ending + 1; ++i)
      lengths[i] = static_cast<double>(m_keyTimes[i + 1] - m_keyTimes[i]);
    bool even = true;
    for (int i = hasBefore ? 0 : kFirst; i < m_ending + hasAfter; ++i) even &= lengths[i] == lengths[kFirst];
    if (even) {  // without divisions, which would cost as much as all the rest
      std::fill_n(m_leaving + kFirst, m_ending - kFirst, Tangent::between(1, 1));
      std::fill_n(m_arriving + kFirst, m_ending - kFirst, Tangent::between(1, 1));
    } else {
      for (int i = kFirst; i < m_ending; ++i) {
        m_leaving[i] = Tangent::between(lengths[i], lengths[i - 1]);
        m_arriving[i] = Tangent::between(lengths[i], lengths[i + 1]);
      }
    }
    if (!hasBefore) m_leaving[kFirst] = Tangent::oneSided();
    if (!hasAfter) m_arriving[m_ending - 1] = Tangent::oneSided();
  }

  // The next n samples, which lie in spans of the window.
  void takeBatch(int n) {
    findSpans(n);
    bool const rotation = m_track.shape() == Shape::Rotation;
    if (rotation && m_kind != Interpolation::Constant) {
      if (m_kind == Interpolation::Linear) {
        rotations<Arc>(n, [this](int span) {
          Quat const a = quat(span);
          return Arc(a, interpolation::nearest(quat(span + 1), a));
        });
      } else {
        rotations<SquadSpan>(n, [this](int span) {
          Quat const a = quat(span);
          return SquadSpan(m_leaving[span], m_arriving[span], quat(span - 1), a,
                           interpolation::nearest(quat(span + 1), a), quat(span + 2));
        });
      }
    } else {
      for (int c = 0; c < width(); ++c) component(m_values[c], n, out(m_next) + m_firstComponent + c);
    }
    m_next += n;
  }

  // Which span each sample lies in and how far, from 0 to 1.
  void findSpans(int n) {
    std::array<int64, kChunk> times;
    m_times.read(m_next, n, times.data());
    int span = m_span;
    for (int i = 0; i < n; ++i) {
      int64 const time = times[at(i)];
      while (m_keyTimes[span + 1] <= time) ++span;
      m_spans[i] = span;
      m_part[i] = static_cast<double>(time - m_keyTimes[span]) /
                  static_cast<double>(m_keyTimes[span + 1] - m_keyTimes[span]);
    }
    m_span = span;
  }

  // A sample at a key is the key, even where what lies around is no number.
  void component(double const* values, int n, double* to) {
    if (m_kind == Interpolation::Constant) {
      for (int i = 0; i < n; ++i) to[i * m_stride] = values[m_spans[i]];
    } else if (m_kind == Interpolation::Linear) {
      for (int i = 0; i < n; ++i) {
        double const a = values[m_spans[i]], b = values[m_spans[i] + 1];
        to[i * m_stride] = m_part[i] == 0 ? a : a + (b - a) * m_part[i];
      }
    } else {
      int const end = m_spans[n - 1] + 1;
      for (int i = m_spans[0]; i < end; ++i) {
        double const before = values[i - 1], a = values[i], b = values[i + 1], after = values[i + 2];
        m_cubics[i] = CubicSpan(a, m_leaving[i](b - a, a - before), b, m_arriving[i](b - a, after - b));
      }
      for (int i = 0; i < n; ++i) {
        CubicSpan const& cubic = m_cubics[m_spans[i]];
        to[i * m_stride] = m_part[i] == 0 ? cubic.start() : cubic.at(m_part[i]);
      }
    }
  }

  template <class Span, class Make>
  void rotations(int n, Make make) {
    Span span;
    int known = -1;
    for (int i = 0; i < n; ++i) {
      double* to = out(m_next + i);
      if (m_part[i] == 0) {
        for (int c = 0; c < 4; ++c) to[c] = m_values[c][m_spans[i]];
        continue;
      }
      if (m_spans[i] != known) span = make(known = m_spans[i]);
      Quat const q = span.at(m_part[i]);
      to[0] = q.v.x, to[1] = q.v.y, to[2] = q.v.z, to[3] = q.r;
    }
  }

  Quat quat(int key) const {
    return {m_values[3][key], m_values[0][key], m_values[1][key], m_values[2][key]};
  }

  KeyTrack const& m_track;
  SampleTimes const& m_times;
  Interpolation m_kind;
  unsigned m_holding;
  int m_firstComponent, m_endComponent;
  double* m_out;
  ptrdiff_t m_stride;
  int64 m_next = 0;  // the sample

  // The window.
  int m_size = 0, m_span = 0, m_ending = 0;  // its keys; the span of the next sample; the last span's end
  Place m_previous;                          // the last slot of the leaf in it, whether or not its key is
  int64 m_keyTimes[kWindow];
  double m_values[4][kWindow];
  Tangent m_leaving[kWindow], m_arriving[kWindow];  // of the spans that start at the keys
  CubicSpan m_cubics[kWindow];

  // The batch.
  int m_spans[kChunk];    // of each sample
  double m_part[kChunk];  // how far it lies in that, from 0 to 1
};

void KeyTrack::sample(SampleTimes const& times, Interpolation kind, Values const& defaults, unsigned mask,
                      double* out, ptrdiff_t stride) const {
  mask = normal(mask);
  if (times.count() == 0 || mask == 0) return;
  auto const sampleCurve = [&](unsigned holding, int first, int end) {
    if (nextHolding(-1, holding) >= 0)
      return Sampler(*this, times, kind, holding, first, end, out, stride).run();
    for (int c = first; c < end; ++c)
      for (int64 i = 0; i < times.count(); ++i) out[i * stride + c] = defaults[static_cast<size_t>(c)];
  };
  bool const whole = countHolding(kAll) == count();
  if (m_shape != Shape::Vector || (whole && mask == kAll)) return sampleCurve(kAll, 0, width());
  for (int c = 0; c < 3; ++c)
    if (mask >> c & 1) sampleCurve(whole ? unsigned{kAll} : 1u << c, c, c + 1);
}
