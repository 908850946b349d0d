// An animated channel of a module: a default value and, for each clip and layer, a track of keys.
//
//  1. With no active clip (the base clip) a channel reads as its default value and holds no keys.
//  2. The lowest layer of the active clip gives the value; each further layer with keys adds to it (numbers)
//  or
//     composes on the right (rotations). A lowest layer without keys gives the default value.
//  3. Key operations read and edit the active layer of the active clip.
//  4. Every change of keys stands between beginDataEdit and endDataEdit (DataEdit); the setters here open an
//  edit of
//     their own, so that callers do so only to make one of several.
//
// Times are ticks, angles radians, lengths millimetres. Masks: 1 x, 2 y, 4 z, 7 all; one-valued channels use
// 1 or 7.
#pragma once

#include <cassert>
#include <functional>
#include <memory>
#include <span>
#include <vector>

#include "host/base/ControlID.h"
#include "host/base/HString.h"
#include "host/keys/KeyTrack.h"
#include "host/math/TalixRotation.h"
#include "host/math/Vec3.h"
#include "host/scene/DataSource.h"
#include "host/time/HTimeRange.h"

class Database;
class PackedStep;
class UndoChange;
struct TrackName;
class Module;
class NLEClip;
class SampleTimes;
struct ReductionTolerances;

class Controller : public DataSource {
  H_DECLARE_CLASS(Controller, DataSource)

 public:
  using Values = KeyTrack::Values;

  // --- names, those of the current scene ---
  static PropertyType mapToPropertyType(HString const& name);
  static PropertyType mapToPropertyType(unsigned id);
  static HString mapPropertyId(unsigned id);
  static unsigned mapPropertyName(HString const& name);  // 0: no channel
  // Trims blanks, restores a known name's case (with a component as well: "translation.y" ->
  // "Translation.y"), expands tx ty tz rx ry rz sx sy sz.
  static void fixChannelStr(HString& text);

  // A new channel of a kind; its module gives it an owner and a name.
  static std::unique_ptr<Controller> create(PropertyType type);

  HString getName() const;
  unsigned getPropertyId() const { return m_propertyId; }
  virtual PropertyType getPropertyType() const = 0;
  Module* getModule() const { return m_module; }
  inline Database* getDatabase() const;  // its module's
  ControlID getID() const { return m_id; }

  // --- editing ---
  // When a
  // clip is active that holds keys, and neither the clip, nor the layer, nor the module, nor the channel is
  // locked.
  bool isEditable() const override;
  bool isLocked() const { return m_locked; }
  void setLocked(bool locked);

  // Ranges are hints.
  virtual void beginDefaultEdit();
  virtual void beginDataEdit(HTimeRange const& range);
  virtual void endDataEdit();

  // --- keys of the active layer; a key beyond them has no time (0), components or flags, its value is the
  // default one, and none is written ---
  virtual int getNumKeys() const;
  virtual int getNumKeys(unsigned mask) const;
  virtual int getNumSelectedKeys() const;
  virtual int getNumSelectedKeys(unsigned mask) const;
  virtual int getSelectedKeyIndex(int i) const;
  virtual unsigned getSelectedKeyFlags(int i) const;
  virtual int64 getKeyTime(int key) const;
  virtual bool keyHasComponents(int key, unsigned mask) const;
  virtual bool hasKeyAt(int64 time) const;                 // any components
  virtual bool hasKeyAt(int64 time, unsigned mask) const;  // all of these
  virtual bool isKeySelectedAt(int64 time, unsigned mask) const;
  // From the first to the last key; empty without keys.
  virtual HTimeRange getKeyRange() const;

  virtual int selectKeys(HTimeRange const& range, unsigned mask);
  virtual int deselectKeys(HTimeRange const& range, unsigned mask);
  // These return how many keys lost something, and take away no other data than what was chosen: a key, all
  // frames of a range, the selected keys and what lies between neighbours among them (KeyTrack::deleteRange).
  // allLayers: in every layer of the active clip that is not locked.
  virtual int deleteKey(int64 time, unsigned mask);
  virtual int deleteKeys(HTimeRange const& range, unsigned mask, bool allLayers);
  virtual int deleteSelectedKeys(unsigned mask);
  // Lets the keys in a range bridge these components to their next keys, so that there is data between them.
  void bridgeKeys(HTimeRange const& range, unsigned mask);
  // Removes the keys in the ranges (sorted and disjoint; the selected keys) that the curve of the layer does
  // not need within the tolerances, measured against the curve as it is now (KeyReduction.h says how). What
  // stays bridges over them. They return how many keys lost something.
  int reduceKeys(std::span<HTimeRange const> ranges, ReductionTolerances const& tolerances);
  int reduceSelectedKeys(ReductionTolerances const& tolerances);

  // Raw values: 1, 3 or 4 doubles (a rotation's quaternion), as KeyTrack holds them.
  void readKey(int key, Values& values) const;
  // Values that are not finite are not written.
  void writeKey(int key, Values const& values, unsigned mask);
  void writeKeyAt(int64 time, Values const& values, unsigned mask);
  virtual void evaluate(int64 time, Values& values) const;
  // The value of the active layer alone, to which a relative edit adds.
  void evaluateLayer(int64 time, Values& values) const;
  // The value that the active layer must have at a time for all layers together to give `wanted`.
  virtual Values solveLayer(int64 time, Values const& wanted) const;
  Values const& getDefaultValues() const { return m_default; }
  void setDefaultValues(Values const& values);  // not taken when not finite

  // --- interpolation ---
  virtual int getNumInterpTypes() const;
  virtual char const* getInterpTypeName(int i) const;  // null beyond them
  virtual void setInterpType(int i);                   // a number that is none of the channel's is not taken
  Interpolation getInterpolation() const { return m_interpolation; }

  // --- clips and layers ---
  // The keys in a
  // clip and layer; null when it has none there.
  KeyTrack const* findTrack(NLEClip const* clip, int layer) const;
  KeyTrack const* findActiveTrack() const;
  // Calls visit(clip, layer, track) for all tracks, empty ones too. In a scene their clips are in it as well.
  template <class Visit>
  void forEachTrack(Visit visit) const {
    for (ClipTrack const& each : m_tracks) visit(each.clip, each.layer, each.track);
  }
  // The values at ascending times in a clip that holds keys (null: the default value), as KeyTrack holds
  // them, one after the other. Several threads may do so at once.
  void sample(NLEClip const* clip, SampleTimes const& times, double* out) const;
  // The keys that tell where the channel has data in a clip (DataRanges.h): those of the lowest layer that
  // has any; null without keys.
  KeyTrack const* findDataTrack(NLEClip const* clip) const;
  // Whether its values are measurements, which are never made up where there is no data: a marker's
  // translation, a device's channels. Other channels have values at all times.
  bool isMeasured() const;
  // Ticks between the times at which it may have data in a clip: the clip's frames, the samples of a device's
  // float channels.
  int64 getDataPeriod(NLEClip const& clip) const;
  // Replaces the keys in a clip and layer: how importers, copies and undo put whole tracks in place.
  void setTrack(NLEClip* clip, int layer, KeyTrack track);
  bool hasKeysInClip(NLEClip const* clip) const;
  HTimeRange getKeyRangeInClip(NLEClip const* clip) const;
  void forgetClip(NLEClip const* clip);
  // The change of single keys that a kept undo step holds as bytes.
  static std::unique_ptr<UndoChange> unpackKeys(TrackName const& track, PackedStep& step);

  // Copies default value, interpolation and the keys of the active clip from a channel of the same kind.
  // Locked layers stay as they are, with a warning. False when the kinds differ or no layer is editable.
  virtual bool copyFrom(Controller const* source, bool keys, bool selectionToo);

  // What adds nothing in a layer above the lowest.
  virtual Values neutral() const { return {}; }

  // The shape that keys of a kind of channel have.
  static KeyTrack::Shape shapeOf(PropertyType type);

 protected:
  Controller(Interpolation interpolation, int numInterpTypes)
      : m_interpolation(interpolation), m_numInterpTypes(static_cast<unsigned char>(numInterpTypes)) {}
  // Layers above the lowest: adds `layer` to `values`.
  virtual void compose(Values& values, Values const& layer) const;
  // Clips of a blend: the weighted mean of `count` values; weights sum to 1.
  virtual void blend(Values const* values, double const* weights, int count, Values& out) const;

  // What a layer of a clip gives at a time; false, and the value that changes nothing, when it holds no keys
  // and is not the lowest.
  bool evaluateLayer(NLEClip const* clip, int layer, int64 time, Values& values) const;

  Values m_default{};

 private:
  friend class Module;

  struct KeyChange;
  struct TracksChange;
  struct SettingsChange;
  struct ClipTrack {
    NLEClip* clip;
    int layer;
    KeyTrack track;
    mutable KeyTrack::Cursor cursor{};
    uint64 undoMark = 0;
    uint64 madeInStep = 0;        // the undo step, 0: none was open
    KeyChange* change = nullptr;  // that of the undo step in undoMark
  };
  ClipTrack const* find(NLEClip const* clip, int layer) const;
  KeyTrack const* activeTrackWith(int key) const;  // null when it has no key of that index
  // The mutator of a track: that of the active layer, made when there is none, for an edit of keys from
  // `first` to `last`; only at a single time it may add one. Null on the base clip.
  KeyTrack* editTrack(int64 first, int64 last);
  KeyTrack* editTrack(NLEClip* clip, int layer, int64 first, int64 last);
  // The same for a deletion, which also changes the ends of bridges.
  KeyTrack* trackToDelete(NLEClip* clip, int layer, int64 first, int64 last);
  KeyTrack::BridgeEnds bridgeEnds() const;
  // The same for all keys, with keys at other times.
  template <class Record>
  KeyTrack& recordedTrack(NLEClip* clip, int layer, Record record);
  KeyTrack& replaceTrack(NLEClip* clip, int layer);
  ClipTrack& clipTrack(NLEClip* clip, int layer);
  void dropTrack(NLEClip const* clip, int layer);
  // The change of a track in this undo step; null when none is to be recorded.
  KeyChange* changeOf(ClipTrack& track);
  // An edit, unless one is open.
  class OwnEdit {
   public:
    explicit OwnEdit(Controller& channel, HTimeRange const& range = HTimeRange::forever())
        : m_channel(channel.m_editDepth == 0 ? &channel : nullptr) {
      if (m_channel) m_channel->beginDataEdit(range);
    }
    ~OwnEdit() {
      if (m_channel) m_channel->endDataEdit();
    }
    OwnEdit(OwnEdit const&) = delete;
    OwnEdit& operator=(OwnEdit const&) = delete;

   private:
    Controller* m_channel;
  };
  void checkEdit() const { assert(m_editDepth > 0 && "keys change outside of an edit"); }
  void recordSettings();
  int64 memoryAlone() const;
  void evaluateInClip(NLEClip const* clip, int64 time, Values& values) const;
  int reduce(std::function<bool(KeyTrack::Key const&)> mayGo, ReductionTolerances const& tolerances);
  bool areFinite(Values const& values, unsigned mask) const;
  void changed();

  // Everything that edits of data change: keys (snapshots), default value, interpolation.
  struct State {
    std::vector<ClipTrack> tracks;
    Values byDefault;
    Interpolation interpolation;
  };
  State getState() const { return {m_tracks, m_default, m_interpolation}; }
  void restore(State const& state);
  void storeTracks(std::vector<ClipTrack> tracks);  // the mutator of all keys at once

  Module* m_module = nullptr;
  ControlID m_id;
  unsigned m_propertyId = 0;
  Interpolation m_interpolation;
  unsigned char m_numInterpTypes;  // the first so many of Constant, Linear, Cubic
  bool m_locked = false;
  int m_editDepth = 0;
  std::vector<ClipTrack> m_tracks;
  uint64 m_settingsMark = 0;  // of undo steps
};
