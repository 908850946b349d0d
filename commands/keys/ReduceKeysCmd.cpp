#include <algorithm>
#include <vector>

#include "commands/keys/KeyTargets.h"
#include "host/keys/KeyReduction.h"
#include "host/scene/DataEdit.h"
#include "host/scene/HTimeManager.h"

namespace {

class ReduceKeysCmd final : public ScriptCommand<ReduceKeysCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "reduceKeys",
      .displayName = "Reduce Keys",
      .category = "Data Editing",
      .purpose = "Removes keys that the curve does not need to keep its shape.",
      .example = "reduceKeys -all",
      .argsText =
          "On whole active channels of the selected modules, in the active layer; without an option the "
          "selected keys. Curves may move by 0.1 mm, 0.1 degrees or 0.1 % of their range: settings, see "
          "docs/profile.md. Channels with fewer than 4 keys stay as they are.",
      .options = {{"all", "all keys of the active channels, selected or not", 0, Variable::None, 2},
                  {"ranges", "the keys in the selected time ranges, selected or not", 0, Variable::None, 1}}};

  bool execute(Given const& given, Args const&, Variable&) override;
};

// Reduces one channel after the other and counts.
class KeyThinning {
 public:
  KeyThinning(bool all, bool ranges) : m_all(all), m_byRange(ranges) {
    HTimeManager const* time = HTimeManager::getInstance();
    for (int i = 0; i < time->getNumSelectedRanges(); ++i) m_ranges.push_back(time->getSelectedTimeRange(i));
  }

  void thin(Module const& module) {
    std::vector<Controller const*> done;
    for (int i = 0; i < g_db->getNumActiveProperties(); ++i) {
      Controller* channel = module.getProperty(g_db->getActiveProperty(i));
      if (!channel || channel->getNumKeys() < kLeastKeys || !channel->isEditable()) continue;
      // A channel that several components name is reduced whole at the first: the tolerance counts from the
      // curve as it was.
      bool const first = std::find(done.begin(), done.end(), channel) == done.end();
      done.push_back(channel);
      m_all       ? thin(*channel, first, {HTimeRange::forever()}, channel->getKeyRange())
      : m_byRange ? thin(*channel, first, m_ranges, hull(m_ranges))
                  : thinSelected(*channel, first);
    }
  }

  void report() const {
    m_keys ? Command::logInfo("Reduced %d keys on %d channels", m_keys, m_channels)
           : Command::logInfo("No keys removed");
  }

 private:
  static constexpr int kLeastKeys = 4;

  static HTimeRange hull(std::vector<HTimeRange> const& ranges) {
    return ranges.empty() ? HTimeRange() : HTimeRange(ranges.front().getStart(), ranges.back().getEnd());
  }

  void thin(Controller& channel, bool first, std::vector<HTimeRange> const& ranges, HTimeRange const& hull) {
    if (ranges.empty()) return;
    DataEdit const edit(channel, hull);
    if (first) m_keys += channel.reduceKeys(ranges, m_tolerances);
    ++m_channels;
  }

  void thinSelected(Controller& channel, bool first) {
    int const selected = channel.getNumSelectedKeys();
    if (selected == 0) return;
    auto const timeOf = [&](int i) { return channel.getKeyTime(channel.getSelectedKeyIndex(i)); };
    DataEdit const edit(channel, HTimeRange(timeOf(0), timeOf(selected - 1)));
    if (first) m_keys += channel.reduceSelectedKeys(m_tolerances);
    ++m_channels;
  }

  ReductionTolerances const m_tolerances = ReductionTolerances::fromProfile();
  bool m_all, m_byRange;
  std::vector<HTimeRange> m_ranges;
  int m_keys = 0, m_channels = 0;
};

bool ReduceKeysCmd::execute(Given const& given, Args const&, Variable&) {
  if (g_db->getNumSelectedModules() == 0) {
    logWarning("No items selected for key reduction");
    return true;
  }
  GivenOptions const options(given);
  KeyThinning thinning(options.has(info.option("all")), options.has(info.option("ranges")));
  eachModule(Among::selected, [&](Module const& module) { thinning.thin(module); });
  thinning.report();
  return true;
}

}  // namespace

Command* newReduceKeysCmd() { return new (std::nothrow) ReduceKeysCmd; }
