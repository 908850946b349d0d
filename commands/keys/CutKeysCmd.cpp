#include "commands/keys/KeyTargets.h"
#include "host/scene/DataEdit.h"
#include "host/scene/HTimeManager.h"

namespace {

class CutKeysCmd final : public ScriptCommand<CutKeysCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "cutKeys",
      .displayName = "Cut Keys",
      .category = "Data Editing",
      .purpose =
          "Removes keys from the active channels: the selected ones, those "
          "in the selected time ranges, or all.",
      .example = "cutKeys -ranges -allLayers",
      .argsText =
          "On the selected modules, in the active layer; without an option the selected keys only. Only the "
          "active components go; rotations lose the whole key. What lay between removed keys is a gap.",
      .options = {
          {"all", "every key of the active channels, selected or not", 0, Variable::None, 2},
          {"ranges", "the keys in the selected time ranges, selected or not", 0, Variable::None, 1},
          {"allLayers", "in every layer of the active clip; ignored without -all or -ranges"},
          {"onMod", "path of the one module to cut from instead; something must be selected all the same", 1,
           Variable::String}}};

  bool execute(Given const& given, Args const&, Variable&) override;
};

// Removes keys from one channel after the other and counts them.
class KeyCut {
 public:
  KeyCut(bool all, bool ranges, bool allLayers) : m_all(all), m_ranges(ranges), m_allLayers(allLayers) {}

  void cut(Module const& module) {
    for (int i = 0; i < g_db->getNumActiveProperties(); ++i) {
      unsigned const id = g_db->getActiveProperty(i);
      Controller* channel = module.getProperty(id);
      if (!channel || channel->getNumKeys() == 0 || !channel->isEditable()) continue;
      unsigned const mask = componentMask(id);
      // Keys of rotations go whole.
      unsigned const lost = objectAs<RotController>(channel) ? KeyTrack::kAll : mask;
      m_all      ? cutAll(*channel, mask, lost)
      : m_ranges ? cutRanges(*channel, lost)
                 : cutSelected(*channel, mask, lost);
    }
  }

  void report() const {
    m_keys ? Command::logInfo("Cut %d keys on %d channels", m_keys, m_channels)
           : Command::logInfo("No keys to cut");
  }

 private:
  void cutAll(Controller& channel, unsigned mask, unsigned lost) {
    m_keys += channel.getNumKeys();
    KeyTrack const& track = *channel.findActiveTrack();
    DataEdit const edit(channel, m_allLayers ? channel.getKeyRangeInClip(g_db->getActiveClip())
                                             : rangeBetween(track, track.nextHolding(-1, mask),
                                                            track.previousHolding(track.count(), mask)));
    channel.deleteKeys(HTimeRange::forever(), lost, m_allLayers);
    ++m_channels;
  }

  void cutRanges(Controller& channel, unsigned lost) {
    HTimeManager const* time = HTimeManager::getInstance();
    for (int i = 0; i < time->getNumSelectedRanges(); ++i) {
      HTimeRange const range = time->getSelectedTimeRange(i);
      DataEdit const edit(channel, range);
      m_keys += channel.deleteKeys(range, lost, m_allLayers);
    }
    if (time->getNumSelectedRanges() > 0) ++m_channels;
  }

  void cutSelected(Controller& channel, unsigned mask, unsigned lost) {
    int const count = channel.getNumSelectedKeys(mask);
    if (count == 0) return;
    KeyTrack const& track = *channel.findActiveTrack();
    DataEdit const edit(channel, rangeBetween(track, track.nextSelected(-1, mask),
                                              track.previousSelected(track.count(), mask)));
    channel.deleteSelectedKeys(lost);
    m_keys += count;
    ++m_channels;
  }

  // Empty when there are no such keys.
  static HTimeRange rangeBetween(KeyTrack const& track, int64 first, int64 last) {
    return first < 0 ? HTimeRange() : HTimeRange(track.timeAt(first), track.timeAt(last));
  }

  bool m_all, m_ranges, m_allLayers;
  int m_keys = 0, m_channels = 0;
};

bool CutKeysCmd::execute(Given const& given, Args const&, Variable&) {
  // kept: "-onMod" needs a selection as well.
  if (g_db->getNumSelectedModules() == 0) {
    logWarning("No items selected for key cutting");
    return true;
  }
  Module* onMod = nullptr;
  if (!readOnMod(given, info.option("onMod"), "%s is not a valid path to a module in the scene", onMod))
    return false;
  GivenOptions const options(given);
  bool const all = options.has(info.option("all")), ranges = options.has(info.option("ranges")),
             allLayers = options.has(info.option("allLayers"));
  if (allLayers && !all && !ranges)
    logWarning("Option -allLayers must be specified with -all or -ranges options. Ignoring");

  KeyCut cut(all, ranges, allLayers);
  eachTarget(onMod, [&](Module const& module) { cut.cut(module); });
  cut.report();
  return true;
}

}  // namespace

Command* newCutKeysCmd() { return new (std::nothrow) CutKeysCmd; }
