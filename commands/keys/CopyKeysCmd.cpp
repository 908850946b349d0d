#include "commands/keys/KeyClipboard.h"
#include "commands/keys/KeyTargets.h"
#include "host/command/Angles.h"
#include "host/scene/Database.h"
#include "host/scene/HTimeManager.h"
#include "host/scene/Node.h"

namespace {

class CopyKeysCmd final : public ScriptCommand<CopyKeysCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "copyKeys",
      .displayName = "Copy Keys",
      .category = "Data Editing",
      .purpose = "Puts keys of the active channels of one selected module on the key clipboard.",
      .example = "copyKeys -all",
      .argsText =
          "Needs exactly one selected module and one active channel (selectChannels), whole or by component. "
          "Takes keys of the active layer, the selected ones without an option, and returns how many.",
      .options = {{"all", "every key of the channel, selected or not", 0, Variable::None, 2},
                  {"ranges", "the keys in the selected time ranges, selected or not", 0, Variable::None, 1}},
      .returns = Variable::Int};

  bool execute(Given const& given, Args const&, Variable& result) override;
};

enum class Choice { selected, ranges, all };

// The components that a copy of whole keys takes: those that any active property marks.
unsigned componentsOfCopy() {
  unsigned mask = 0;
  for (int i = 0; i < g_db->getNumActiveProperties(); ++i)
    mask |= markedComponents(g_db->getActiveProperty(i));
  return mask;
}

// Puts keys of one channel on the clipboard.
class KeyCopy {
 public:
  KeyCopy(Controller const& channel, Choice choice)
      : m_channel(channel),
        m_choice(choice),
        m_order(rotationOrderOf(*channel.getModule())),
        m_mask(componentsOfCopy()) {}

  // Returns the number of keys.
  int run() {
    KeyTrack const* track = m_channel.findActiveTrack();
    if (!track) return 0;
    if (m_choice != Choice::ranges) {
      addKeys(*track, 0, track->count(), false);
      return m_count;
    }
    HTimeManager const* time = HTimeManager::getInstance();
    for (int i = 0, ranges = time->getNumSelectedRanges(); i < ranges; ++i) {
      HTimeRange const range = time->getSelectedTimeRange(i);
      int64 const last = track->lowerBound(range.getEnd() + 1);
      bool const goesOn = i + 1 < ranges && last < track->count() &&
                          time->getSelectedTimeRange(i + 1).contains(track->timeAt(last));
      addKeys(*track, track->lowerBound(range.getStart()), last, goesOn);
    }
    return m_count;
  }

 private:
  // goesOn: the key after the last one is copied as well.
  void addKeys(KeyTrack const& track, int64 first, int64 last, bool goesOn) {
    int64 index = first;
    track.forEach(first, last, [&](KeyTrack::Key const& key) {
      bool const nextToo = index + 1 < last || goesOn;
      if (m_choice != Choice::selected) add(key, nextToo ? dataAfter(track, key) : 0);
      if (m_choice == Choice::selected && key.selected) add(key, bridgesToSelected(track, index, key));
      ++index;
    });
  }

  // The components whose data goes on after a key, which may lack them.
  static unsigned dataAfter(KeyTrack const& track, KeyTrack::Key const& key) {
    return key.components == KeyTrack::kAll
               ? key.bridges
               : key.bridges | (track.bridgedAt(key.time) & ~static_cast<unsigned>(key.components));
  }
  static unsigned bridgesToSelected(KeyTrack const& track, int64 index, KeyTrack::Key const& key) {
    unsigned kept = 0;
    for (unsigned const component : {1u, 2u, 4u})
      if (int64 const next = key.bridges & component ? track.nextHolding(index, component) : -1; next >= 0)
        kept |= component & track.at(next).selected;
    return kept;
  }

  void add(KeyTrack::Key const& key, unsigned bridges) {
    ClipboardManager::tagKey record;
    record.time = key.time;
    record.components = isOneValued(m_channel)         ? key.components
                        : m_choice == Choice::selected ? key.selected
                                                       : m_mask;
    record.flags = key.components;
    record.bridges = bridges & record.components;
    Vec3 const value = valueOf(key, record.components);
    value.getValue(record.x, record.y, record.z);
    g_db->getClipboardManager()->addKey(record);
    ++m_count;
  }

  // A component that is copied though the key lacks it has the layer's value there.
  Vec3 valueOf(KeyTrack::Key const& key, unsigned components) const {
    if (objectAs<RotController>(&m_channel)) {
      TalixRotation rotation;
      rotation.setQuaternion(key.values.data());
      Vec3 angles;
      rotation.getAsEuler(m_order, angles);
      return angles;
    }
    Controller::Values values = key.values;
    if (components & ~static_cast<unsigned>(key.components)) m_channel.evaluateLayer(key.time, values);
    return Vec3(values.data());
  }

  Controller const& m_channel;
  Choice m_choice;
  TalixRotation::RotOrder m_order;
  unsigned m_mask;
  int m_count = 0;
};

bool CopyKeysCmd::execute(Given const& given, Args const&, Variable& result) {
  // Step 1: one module, some channel.
  if (g_db->getNumSelectedModules() != 1) {
    logError("Can only copy from one selected module");
    return false;
  }
  if (g_db->getNumActiveProperties() == 0) {
    logError("Must have at least one channel selected");
    return false;
  }

  // Step 2: which keys. kept: options are told by name, not by index.
  Choice choice = Choice::selected;
  for (CommandOption const& option : given) {
    if (option.getName() == "all") choice = Choice::all;
    if (option.getName() == "ranges" && choice != Choice::all) choice = Choice::ranges;
  }

  // Step 3: one channel.
  if (!nameOneChannel()) {
    logWarning("Can only copy from one set of keys");
    return true;
  }

  // Step 4: the copy. A channel that the module lacks has no keys.
  Controller const* channel = activeChannel();
  ClipboardManager* clipboard = g_db->getClipboardManager();
  clipboard->startClipboardCopy(ClipboardManager::ControllerData, clipboardTypeOf(channel),
                                channel ? rotationOrderOf(*channel->getModule()) : TalixRotation::XYZ);
  int const count = channel ? KeyCopy(*channel, choice).run() : 0;
  clipboard->finishClipboardCopy(true);
  logInfo("Copied %d keys to clipboard", count);
  return answer(result, count);
}

}  // namespace

Command* newCopyKeysCmd() { return new (std::nothrow) CopyKeysCmd; }
