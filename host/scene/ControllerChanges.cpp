// The mutators of a channel: its keys, its settings.
#include <algorithm>

#include "host/scene/ChangeSetBuilder.h"
#include "host/scene/Clips.h"
#include "host/scene/Controller.h"
#include "host/scene/Database.h"

namespace {

// Beyond about so many keys a snapshot of the track, which costs no more than its leaves that are changed, is
// the smaller record.
constexpr size_t kKeysBeforeSnapshot = 64;

}  // namespace

// The keys of a track: single ones as long as they are few, else a snapshot of all.
struct Controller::KeyChange : UndoChange {
  // A key that may be missing.
  struct Slot {
    KeyTrack::Key key;  // with its time
    bool present = false;

    Slot() = default;
    Slot(KeyTrack const& track, int64 time) {
      key.time = time;
      int64 const index = track.find(time);
      present = index >= 0;
      if (present) key = track.at(index);
    }

    bool operator==(Slot const& o) const {
      return present == o.present &&
             (!present || (key.values == o.key.values && key.components == o.key.components &&
                           key.selected == o.key.selected && key.bridges == o.key.bridges));
    }
    // Makes the track so at this time.
    void putInto(KeyTrack& track) const { present ? track.restore(key) : track.restoreNone(key.time); }
  };

  KeyChange(Controller& concerned, NLEClip* ofClip, int ofLayer)
      : UndoChange(concerned.m_module), channel(concerned), clip(ofClip), layer(ofLayer) {}

  // Keys from first to last are about to change; a single time also when it has no key yet.
  void note(KeyTrack const& track, int64 first, int64 last) {
    if (snapshot) return;
    if (first == last) return noteKey(track, first);
    int64 const from = track.lowerBound(first);
    int64 const to = last >= kForever ? track.count() : track.lowerBound(last + 1);
    if (to - from > static_cast<int64>(kKeysBeforeSnapshot)) return takeSnapshot(track);
    for (int64 i = from; i < to && !snapshot; ++i) noteKey(track, track.timeAt(i));
  }
  void noteKey(KeyTrack const& track, int64 time) {
    for (Slot const& slot : keys)
      if (slot.key.time == time) return;
    if (keys.size() == kKeysBeforeSnapshot) return takeSnapshot(track);
    keys.emplace_back(track, time);
  }
  void takeSnapshot(KeyTrack const& track) {
    auto before = std::make_unique<KeyTrack>(track);
    for (Slot const& slot : keys) slot.putInto(*before);
    snapshot = std::move(before);
    std::vector<Slot>().swap(keys);
  }

  // For swapping only: makes a track when there is none.
  KeyTrack& track() const { return channel.clipTrack(clip, layer).track; }
  int64 memoryNow() const {
    KeyTrack const* found = channel.findTrack(clip, layer);
    return found ? found->memoryAlone() : 0;
  }

  // A track that has lost its keys goes, so that none stays behind for a clip that leaves the scene next.
  void swap() override {
    KeyTrack& present = track();
    if (snapshot) std::swap(*snapshot, present);
    for (Slot& slot : keys) {
      Slot const now(present, slot.key.time);
      slot.putInto(present);
      slot = now;
    }
    if (present.empty()) channel.dropTrack(clip, layer);
  }
  bool isVoid() const override {
    KeyTrack const none(shapeOf(channel.getPropertyType()));
    KeyTrack const* found = channel.findTrack(clip, layer);
    KeyTrack const& present = found ? *found : none;
    if (snapshot) return snapshot->sharesAll(present) || *snapshot == present;
    return std::all_of(keys.begin(), keys.end(),
                       [&](Slot const& slot) { return slot == Slot(present, slot.key.time); });
  }
  int64 memoryUse() const override {
    return static_cast<int64>(sizeof *this + keys.capacity() * sizeof(Slot)) +
           (snapshot ? std::max(snapshot->memoryAlone(), memoryNow()) : 0);
  }

  // A key is its time, its flags and, when it is there, its values.
  bool isSmall() const override { return !snapshot; }
  void pack(PackedStep& step) const override {
    step.putTrack({&channel, clip, layer});
    step.put(static_cast<unsigned char>(keys.size()));
    for (Slot const& slot : keys) {
      step.put(slot.key.time);
      step.put(static_cast<unsigned short>(slot.key.components | slot.key.selected << 3 |
                                           slot.key.bridges << 6 | slot.present << 9));
      for (int i = 0; slot.present && i < width(); ++i) step.put(slot.key.values[static_cast<size_t>(i)]);
    }
  }
  void unpack(PackedStep& step) {
    size_t left = step.take<unsigned char>();
    keys.reserve(left);
    for (; left > 0; --left) {
      Slot slot;
      slot.key.time = step.take<int64>();
      auto const flags = step.take<unsigned short>();
      slot.key.components = flags & 7;
      slot.key.selected = flags >> 3 & 7;
      slot.key.bridges = flags >> 6 & 7;
      slot.present = flags >> 9 & 1;
      for (int i = 0; slot.present && i < width(); ++i)
        slot.key.values[static_cast<size_t>(i)] = step.take<double>();
      keys.push_back(slot);
    }
  }
  int width() const { return static_cast<int>(shapeOf(channel.getPropertyType())); }

  void tell(ChangeSetBuilder& changes) const override {
    KeyTrack& before = changes.keysBefore(channel, clip, layer);
    if (snapshot) before = *snapshot;
    for (auto slot = keys.rbegin(); slot != keys.rend(); ++slot) slot->putInto(before);
  }

  Controller& channel;
  NLEClip* clip;
  int layer;
  std::vector<Slot> keys;
  std::unique_ptr<KeyTrack> snapshot;  // in place of keys
};

std::unique_ptr<UndoChange> Controller::unpackKeys(TrackName const& track, PackedStep& step) {
  auto change = std::make_unique<KeyChange>(*track.channel, track.clip, track.layer);
  change->unpack(step);
  return change;
}

Controller::ClipTrack& Controller::clipTrack(NLEClip* clip, int layer) {
  for (ClipTrack& track : m_tracks)
    if (track.clip == clip && track.layer == layer) return track;
  return m_tracks.emplace_back(ClipTrack{clip, layer, KeyTrack(shapeOf(getPropertyType()))});
}

void Controller::dropTrack(NLEClip const* clip, int layer) {
  std::erase_if(m_tracks, [=](ClipTrack const& track) { return track.clip == clip && track.layer == layer; });
}

Controller::KeyChange* Controller::changeOf(ClipTrack& track) {
  if (!m_module || !m_module->isRecorded()) return nullptr;
  if (auto* change = m_module->journal().addOnce<KeyChange>(track.undoMark, *this, track.clip, track.layer))
    track.change = change;
  return track.change;
}

KeyTrack* Controller::editTrack(NLEClip* clip, int layer, int64 first, int64 last) {
  checkEdit();
  ClipTrack& track = clipTrack(clip, layer);
  if (KeyChange* change = changeOf(track)) change->note(track.track, first, last);
  return &track.track;
}

KeyTrack* Controller::trackToDelete(NLEClip* clip, int layer, int64 first, int64 last) {
  KeyTrack* track = editTrack(clip, layer, first, last);
  if (!track->bridgesAny()) return track;
  // Bridges into the range end at a key before it or at the frame before it, and begin likewise after it.
  int64 const period = bridgeEnds().framePeriod;
  for (int64 const frame : {frameAtOrAfter(first, period) - 1, frameAtOrBefore(last, period) + 1})
    editTrack(clip, layer, frame * period, frame * period);
  for (unsigned const component : {1u, 2u, 4u}) {
    int64 const before = track->previousHolding(track->lowerBound(first), component);
    if (before >= 0) editTrack(clip, layer, track->timeAt(before), track->timeAt(before));
  }
  return track;
}

KeyTrack& Controller::replaceTrack(NLEClip* clip, int layer) {
  checkEdit();
  ClipTrack& track = clipTrack(clip, layer);
  KeyChange* change = changeOf(track);
  if (change && !change->snapshot) change->takeSnapshot(track.track);
  return track.track;
}

KeyTrack* Controller::editTrack(int64 first, int64 last) {
  Database const& scene = *getDatabase();
  NLEClip* clip = scene.getActiveClip();
  return clip && clip->holdsKeys() ? editTrack(clip, scene.getActiveLayer(), first, last) : nullptr;
}

// --- all tracks at once ---

struct Controller::TracksChange : UndoChange {
  explicit TracksChange(Controller& concerned)
      : UndoChange(concerned.m_module), channel(concerned), tracks(concerned.m_tracks) {}
  void swap() override { channel.m_tracks.swap(tracks); }
  int64 memoryUse() const override {
    int64 alone = 0;
    for (ClipTrack const& track : tracks) alone += track.track.memoryAlone();
    return static_cast<int64>(sizeof *this + tracks.capacity() * sizeof(ClipTrack)) +
           std::max(alone, channel.memoryAlone());
  }

  void tell(ChangeSetBuilder& changes) const override {
    changes.tellNoKeys(channel);
    for (ClipTrack const& track : tracks) changes.keysBefore(channel, track.clip, track.layer) = track.track;
  }

  Controller& channel;
  std::vector<ClipTrack> tracks;
};

void Controller::storeTracks(std::vector<ClipTrack> tracks) {
  checkEdit();
  if (m_module && m_module->isRecorded()) m_module->journal().add(std::make_unique<TracksChange>(*this));
  m_tracks = std::move(tracks);
  // What was recorded of single tracks stands before this change: later edits are recorded anew.
  for (ClipTrack& track : m_tracks) track.undoMark = 0;
  changed();
}

int64 Controller::memoryAlone() const {
  int64 bytes = static_cast<int64>(m_tracks.capacity() * sizeof(ClipTrack));
  for (ClipTrack const& track : m_tracks) bytes += track.track.memoryAlone();
  return bytes;
}

// --- settings ---

struct Controller::SettingsChange : UndoChange {
  explicit SettingsChange(Controller& concerned)
      : UndoChange(concerned.m_module),
        channel(concerned),
        byDefault(concerned.m_default),
        interpolation(concerned.m_interpolation),
        locked(concerned.m_locked) {}
  void swap() override {
    std::swap(byDefault, channel.m_default);
    std::swap(interpolation, channel.m_interpolation);
    std::swap(locked, channel.m_locked);
  }
  bool isVoid() const override {
    return byDefault == channel.m_default && interpolation == channel.m_interpolation &&
           locked == channel.m_locked;
  }
  int64 memoryUse() const override { return sizeof *this; }

  void tell(ChangeSetBuilder& changes) const override {
    Module const* module = channel.m_module;
    std::string const name = channel.getName().GetString();
    auto const values = [this](Values const& all) {
      return textOfList(std::span(all).first(static_cast<size_t>(shapeOf(channel.getPropertyType()))));
    };
    auto const setting = [&](char const* which, std::string const& before, std::string const& after) {
      changes.tell(SceneChange::Kind::attribute, module, name + which, before, after);
    };
    changes.tell(SceneChange::Kind::byDefault, module, name, values(byDefault), values(channel.m_default));
    setting(".Interpolation", channel.getInterpTypeName(static_cast<int>(interpolation)),
            channel.getInterpTypeName(static_cast<int>(channel.m_interpolation)));
    setting(".Locked", locked ? "true" : "false", channel.m_locked ? "true" : "false");
  }

  Controller& channel;
  Values byDefault;
  Interpolation interpolation;
  bool locked;
};

void Controller::recordSettings() {
  if (m_module && m_module->isRecorded()) m_module->journal().addOnce<SettingsChange>(m_settingsMark, *this);
}
