#include "host/keys/KeyInner.h"

#include <algorithm>
#include <new>
#include <utility>

void KeyNodeRef::destroy(KeyNode* node) {
  if (node->isLeaf()) {
    delete static_cast<KeyLeaf*>(node);
  } else {
    delete static_cast<KeyInner*>(node);
  }
}

KeyNode* KeyNodeRef::clone(KeyNode const& node) {
  if (node.isLeaf()) return new KeyLeaf(asLeaf(node));
  return new KeyInner(asInner(node));
}

int64 KeyInner::keysBefore(int i) const {
  int64 sum = 0;
  for (int k = 0; k < i; ++k) sum += m_keys[at(k)];
  return sum;
}

void KeyInner::place(int i, KeyNodeRef child) {
  counts += child->counts;
  m_firstTimes[at(i)] = firstTimeOf(*child.get());
  m_keys[at(i)] = child->counts.keys;
  m_children[at(i)] = std::move(child);
}

KeyNodeRef KeyInner::insert(int i, KeyNodeRef child, KeyNodeRef spare) noexcept {
  if (full()) {
    // Keys that arrive in order, from either end, leave full nodes behind; others halve them.
    int const from = i == m_size ? i : i == 1 ? 1 : m_size / 2;
    auto& right = asInner(*spare.get());
    moveTail(from, right);
    if (i >= from) {
      right.insert(i - from, std::move(child), {});
    } else {
      insert(i, std::move(child), {});
    }
    return spare;
  }
  for (int k = m_size; k > i; --k) {
    m_firstTimes[at(k)] = m_firstTimes[at(k - 1)];
    m_keys[at(k)] = m_keys[at(k - 1)];
    m_children[at(k)] = std::move(m_children[at(k - 1)]);
  }
  ++m_size;
  place(i, std::move(child));
  return {};
}

void KeyInner::moveTail(int from, KeyInner& to) {
  for (int k = from; k < m_size; ++k) {
    counts -= m_children[at(k)]->counts;
    to.place(to.m_size++, std::move(m_children[at(k)]));
  }
  m_size = std::min(m_size, from);
}

int KeyInner::closeGaps(int first) noexcept {
  int kept = first;
  for (int k = first; k < m_size; ++k) {
    if (!m_children[at(k)]) continue;
    if (k != kept) {
      m_firstTimes[at(kept)] = m_firstTimes[at(k)];
      m_keys[at(kept)] = m_keys[at(k)];
      m_children[at(kept)] = std::move(m_children[at(k)]);
    }
    ++kept;
  }
  return std::exchange(m_size, kept) - kept;
}

bool KeyInner::join(int first, int last, bool tightly) noexcept {
  if (m_size < 2) return false;
  int const before = m_size;
  // One of those that were edited tells: the others need not be looked at.
  int64 const limit = level() == 1 ? asLeaf(child(std::min(first, m_size - 1))).limit() : m_fanout;
  for (int i = std::max(first - 1, 0); i + 1 < m_size && i <= last;) {
    if (joins(i, limit, tightly) && joinTwo(i)) {
      --last;
    } else {
      ++i;
    }
  }
  return m_size < before;
}

// Edits of single keys keep some room, so that the next insertion does not split what the last deletion
// joined. Edits of many keys, which are rarer and whose result mostly stays, fill nodes.
bool KeyInner::joins(int i, int64 limit, bool tightly) const {
  auto const room = [=](int64 a, int64 b) {
    if (tightly) return a + b <= limit;
    return std::min(a, b) < std::max<int64>(limit / 4, 2) && a + b <= limit * 3 / 4;
  };
  if (level() == 1) return room(keys(i), keys(i + 1));
  return room(asInner(child(i)).size(), asInner(child(i + 1)).size());
}

// False, and all is as it was, when there is no memory for it: small neighbours do as well.
bool KeyInner::joinTwo(int i) {
  KeyNodeRef& left = m_children[at(i)];
  KeyNodeRef& right = m_children[at(i + 1)];
  try {
    left.own();
    if (left->isLeaf()) asLeaf(*left.get()).append(asLeaf(*right.get()), 0, asLeaf(*right.get()).size());
  } catch (std::bad_alloc const&) {
    return false;
  }
  if (left->isLeaf()) {
    asLeaf(*left.get()).pack();
  } else {
    asInner(*left.get()).append(asInner(*right.get()), right->isShared());
  }
  m_keys[at(i)] = left->counts.keys;
  remove(i + 1);
  return true;
}

void KeyInner::append(KeyInner& from, bool isShared) {
  for (int k = 0; k < from.m_size; ++k) {
    m_firstTimes[at(m_size)] = from.m_firstTimes[at(k)];
    m_keys[at(m_size)] = from.m_keys[at(k)];
    m_children[at(m_size++)] = isShared ? from.m_children[at(k)] : std::move(from.m_children[at(k)]);
  }
  counts += from.counts;
}

void KeyInner::remove(int i) {
  for (int k = i; k + 1 < m_size; ++k) {
    m_firstTimes[at(k)] = m_firstTimes[at(k + 1)];
    m_keys[at(k)] = m_keys[at(k + 1)];
    m_children[at(k)] = std::move(m_children[at(k + 1)]);
  }
  m_children[at(--m_size)].reset();
}
