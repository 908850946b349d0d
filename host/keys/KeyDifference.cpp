#include "host/keys/KeyDifference.h"

#include <algorithm>
#include <cmath>
#include <vector>

#include "host/keys/KeyInner.h"

namespace {

// Goes through a tree from key to key, or over a whole node.
class TreeWalk {
 public:
  explicit TreeWalk(KeyNode const* root) {
    if (root) descend(root);
  }
  bool atEnd() const { return m_path.empty(); }
  KeyLeaf const& leaf() const { return asLeaf(*m_path.back().node); }
  int slot() const { return m_slot; }
  int64 time() const { return leaf().time(m_slot); }
  void next() {
    if (++m_slot == leaf().size()) leave(1);
  }

  // The node of a level (0: the leaf) when the walk stands at its first key, else null.
  KeyNode const* beginning(size_t level) const {
    if (level >= m_path.size() || m_slot > 0) return nullptr;
    for (size_t below = 1; below <= level; ++below)
      if (m_path[m_path.size() - 1 - below].child > 0) return nullptr;
    return m_path[m_path.size() - 1 - level].node;
  }
  // Goes on after the node of that level.
  void skip(size_t level) { leave(level + 1); }

 private:
  struct Step {
    KeyNode const* node;
    int child;
  };

  void descend(KeyNode const* node) {
    while (true) {
      m_path.push_back({node, 0});
      if (node->isLeaf()) break;
      node = &asInner(*node).child(0);
    }
    m_slot = 0;
  }
  void leave(size_t levels) {
    m_path.resize(m_path.size() - levels);
    while (!m_path.empty()) {
      Step& step = m_path.back();
      KeyInner const& inner = asInner(*step.node);
      if (++step.child < inner.size()) return descend(&inner.child(step.child));
      m_path.pop_back();
    }
  }

  std::vector<Step> m_path;  // from the root to the leaf
  int m_slot = 0;
};

// Steps over the largest node that both begin with.
bool skipShared(TreeWalk& a, TreeWalk& b) {
  if (!a.beginning(0) || a.beginning(0) != b.beginning(0)) return false;
  size_t level = 0;
  while (a.beginning(level + 1) && a.beginning(level + 1) == b.beginning(level + 1)) ++level;
  a.skip(level);
  b.skip(level);
  return true;
}

double distance(KeyTrack::Shape shape, TreeWalk const& a, TreeWalk const& b) {
  double from[4] = {}, to[4] = {};
  a.leaf().values(a.slot(), from);
  b.leaf().values(b.slot(), to);
  int const width = static_cast<int>(shape);
  if (shape == KeyTrack::Shape::Rotation) {
    double dot = 0;
    for (int c = 0; c < width; ++c) dot += from[c] * to[c];
    return 2 * std::acos(std::min(1.0, std::abs(dot)));
  }
  unsigned const both = a.leaf().components(a.slot()) & b.leaf().components(b.slot());
  double largest = 0;
  for (int c = 0; c < width; ++c)
    if (both >> c & 1) largest = std::max(largest, std::abs(to[c] - from[c]));
  return largest;
}

bool areSame(int width, TreeWalk const& a, TreeWalk const& b) {
  KeyLeaf const &x = a.leaf(), &y = b.leaf();
  int const i = a.slot(), k = b.slot();
  if (x.components(i) != y.components(k) || x.selected(i) != y.selected(k) || x.bridges(i) != y.bridges(k))
    return false;
  for (int c = 0; c < width; ++c)
    if (x.value(i, c) != y.value(k, c)) return false;
  return true;
}

}  // namespace

KeyDifference differenceOf(KeyTrack const& before, KeyTrack const& after) {
  KeyDifference difference;
  bool any = false;
  auto const note = [&](int64& count, int64 time) {
    if (!any) difference.first = time;
    any = true;
    difference.last = time;
    ++count;
  };
  TreeWalk a(before.root()), b(after.root());
  while (!a.atEnd() && !b.atEnd()) {
    if (skipShared(a, b)) continue;
    if (a.time() < b.time()) {
      note(difference.removed, a.time());
      a.next();
    } else if (b.time() < a.time()) {
      note(difference.added, b.time());
      b.next();
    } else {
      if (!areSame(before.width(), a, b)) {
        note(difference.changed, a.time());
        difference.largest = std::max(difference.largest, distance(before.shape(), a, b));
      }
      a.next();
      b.next();
    }
  }
  for (; !a.atEnd(); a.next()) note(difference.removed, a.time());
  for (; !b.atEnd(); b.next()) note(difference.added, b.time());
  return difference;
}
