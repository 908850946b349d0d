#include "commands/keys/KeyTargets.h"
#include "host/scene/Database.h"
#include "host/scene/HTimeManager.h"
#include "host/scene/Node.h"

namespace {

class FindSelectedKeysCmd final : public ScriptCommand<FindSelectedKeysCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "findSelectedKeys",
      .displayName = "Find Next Selected Keys",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose = "Moves the current time to the next selected key of the selected nodes.",
      .example = "findSelectedKeys -b",
      .argsText =
          "On the active channels of the selected nodes, within the animation range, and around at its end. "
          "Selected keys in a row count as one find. The node that has it becomes the primary selected "
          "module.",
      .options = {{"b", "searches backwards"}}};

  bool execute(Given const& given, Args const&, Variable&) override;
};

// The end of a run of selected keys that a search comes to first.
struct RunEnd {
  Node* node = nullptr;  // null: there is none
  int64 time = 0;
  bool opens = false;  // no key of the range comes before it
};

// A search through the keys of the animation range in one direction.
class RunSearch {
 public:
  explicit RunSearch(bool back)
      : m_range(HTimeManager::getInstance()->getAnimRange()), m_back(back), m_step(back ? -1 : 1) {}

  // Where a search of the whole range begins.
  int64 outset() const { return m_back ? m_range.getEnd() + 1 : m_range.getStart() - 1; }
  bool isBeyond(int64 time, int64 other) const { return m_back ? time < other : time > other; }

  // The nearest run that begins beyond a time, in whichever channel; of several the first in order of
  // selection and of active properties. It opens the range when all those at its time do.
  RunEnd nearest(int64 time) const {
    RunEnd best;
    for (int i = 0; i < g_db->getNumSelectedNodes(); ++i)
      for (int k = 0; k < g_db->getNumActiveProperties(); ++k) {
        RunEnd const found = inChannel(g_db->getSelectedNode(i), g_db->getActiveProperty(k), time);
        if (!found.node) continue;
        if (!best.node || isBeyond(best.time, found.time))
          best = found;
        else if (found.time == best.time)
          best.opens &= found.opens;
      }
    return best;
  }

 private:
  RunEnd inChannel(Node* node, unsigned id, int64 time) const {
    Controller const* channel = node->getProperty(id);
    KeyTrack const* track = channel ? channel->findActiveTrack() : nullptr;
    unsigned const mask = componentMask(id);
    if (!track || !track->countSelected(mask)) return {};

    int64 const first = firstBeyond(*track, outset());
    int64 from = firstBeyond(*track, time);
    if (!isBeyond(from, first)) from = first;
    // A run that the time lies in began before it.
    if (from != first && track->at(from - m_step).selected & mask) {
      from = m_back ? track->previousUnselected(from - m_step, mask)
                    : track->nextUnselected(from - m_step, mask);
      if (from < 0) return {};
    }
    int64 const found =
        m_back ? track->previousSelected(from - m_step, mask) : track->nextSelected(from - m_step, mask);
    if (found < 0 || !m_range.contains(track->timeAt(found))) return {};
    return {node, track->timeAt(found), found == first};
  }

  // The index of the first key beyond a time: before the first or after the last key when there is none.
  int64 firstBeyond(KeyTrack const& track, int64 time) const {
    return m_back ? track.lowerBound(time) - 1 : track.lowerBound(time + 1);
  }

  HTimeRange m_range;
  bool m_back;
  int64 m_step;
};

bool FindSelectedKeysCmd::execute(Given const& given, Args const&, Variable&) {
  if (g_db->getNumSelectedNodes() == 0) {
    logWarning("No nodes selected for searching");
    return true;
  }
  RunSearch const search(GivenOptions(given).has(info.option("b")));

  // The second pass begins at the range's end again; a run that opens the range is left to it. So stepping
  // on and on comes to every run once in each round.
  RunEnd const second = search.nearest(search.outset());
  if (!second.node) {
    logInfo("No selected keys found");
    return true;
  }
  HTimeManager* time = HTimeManager::getInstance();
  bool const skips = second.opens && search.isBeyond(second.time, time->getTime());
  RunEnd found = search.nearest(skips ? second.time : time->getTime());
  if (!found.node) found = second;
  g_db->setPrimarySelectedModule(found.node);
  time->setTime(found.time, true);
  logInfo("Found one or more selected keys");
  return true;
}

}  // namespace

Command* newFindSelectedKeysCmd() { return new (std::nothrow) FindSelectedKeysCmd; }
