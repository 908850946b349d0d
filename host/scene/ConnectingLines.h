// The coloured lines that are drawn from a node to others, at most one to each.
#pragma once

#include <vector>

#include "host/base/ItemAt.h"
#include "host/scene/MarkerConnection.h"
#include "host/scene/ModuleReferrer.h"

class ConnectingLines final : private ModuleReferrer {
 public:
  explicit ConnectingLines(Node& source) : m_source(source) {}
  ~ConnectingLines();
  ConnectingLines(ConnectingLines const&) = delete;
  ConnectingLines& operator=(ConnectingLines const&) = delete;

  int getCount() const { return static_cast<int>(m_lines.size()); }
  MarkerConnection at(int i) const { return itemAt(m_lines, i); }
  bool leadTo(Node const* target) const;       // constant time
  MarkerConnection* find(Node const* target);  // null: none
  // Mutator: the line to a target, null for none.
  void store(Node* target, MarkerConnection const* line);

 private:
  struct Change;
  void forget(Module* module) override;

  Node& m_source;
  std::vector<MarkerConnection> m_lines;
  uint64 m_undoMark = 0;
};
