#include "host/scene/ConnectingLines.h"

#include <algorithm>

#include "host/scene/ChangeSetBuilder.h"
#include "host/scene/Database.h"

Vec3 MarkerConnection::getDefaultColor() { return {128, 128, 128}; }

namespace {

template <class Lines>
auto findLine(Lines& lines, Node const* target) {
  return std::find_if(lines.begin(), lines.end(), [&](auto& line) { return line.getTarget() == target; });
}

}  // namespace

ConnectingLines::~ConnectingLines() {
  for (MarkerConnection const& line : m_lines) release(line.getTarget());
}

bool ConnectingLines::leadTo(Node const* target) const { return refersTo(target); }

MarkerConnection* ConnectingLines::find(Node const* target) {
  return leadTo(target) ? &*findLine(m_lines, target) : nullptr;
}

struct ConnectingLines::Change : UndoChange {
  explicit Change(ConnectingLines& concerned)
      : UndoChange(&concerned.m_source), lines(concerned), other(concerned.m_lines) {}
  void swap() override {
    for (MarkerConnection const& line : other) lines.refer(line.getTarget());
    for (MarkerConnection const& line : lines.m_lines) lines.release(line.getTarget());
    lines.m_lines.swap(other);
  }
  int64 memoryUse() const override {
    return static_cast<int64>(sizeof *this +
                              std::max(other.size(), lines.m_lines.size()) * sizeof(MarkerConnection));
  }

  void tell(ChangeSetBuilder& changes) const override {
    changes.tell(
        SceneChange::Kind::attribute, &lines.m_source, "ConnectingLines", text(other), text(lines.m_lines),
        !std::equal(other.begin(), other.end(), lines.m_lines.begin(), lines.m_lines.end(), areSame));
  }
  static bool areSame(MarkerConnection const& a, MarkerConnection const& b) {
    return a.getTarget() == b.getTarget() && a.getConnectingColor() == b.getConnectingColor();
  }
  static std::string text(std::vector<MarkerConnection> const& all) {
    std::string text;
    for (MarkerConnection const& line : all)
      text += (text.empty() ? "" : " ") + textOf(line.getTarget()) + " (" +
              textOf(line.getConnectingColor()) + ")";
    return text;
  }

  ConnectingLines& lines;
  std::vector<MarkerConnection> other;
};

void ConnectingLines::store(Node* target, MarkerConnection const* line) {
  if (m_source.isRecorded()) m_source.journal().addOnce<Change>(m_undoMark, *this);
  bool const known = leadTo(target);
  if (line && known) {
    *findLine(m_lines, target) = *line;
  } else if (line) {
    m_lines.reserve(m_lines.size() + 1);
    refer(target);
    m_lines.push_back(*line);
  } else if (known) {
    m_lines.erase(findLine(m_lines, target));
    release(target);
  }
}

void ConnectingLines::forget(Module* module) { store(static_cast<Node*>(module), nullptr); }
