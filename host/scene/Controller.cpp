#include "host/scene/Controller.h"

#include <algorithm>
#include <cassert>
#include <climits>
#include <cmath>

#include "host/scene/Clips.h"
#include "host/scene/Database.h"
#include "host/scene/Devices.h"
#include "host/scene/Editability.h"
#include "host/scene/Marker.h"

H_DEFINE_ABSTRACT_CLASS(DataSource);
H_DEFINE_ABSTRACT_CLASS(Controller);

std::unique_ptr<Controller> Controller::create(PropertyType type) {
  switch (type) {
    case Vec3Property:
      return std::make_unique<Vec3Controller>();
    case RotProperty:
      return std::make_unique<RotController>();
    case FloatProperty:
      return std::make_unique<FloatController>();
    case IntProperty:
      return std::make_unique<IntController>();
    case BoolProperty:
      return std::make_unique<BoolController>();
    case NoProperty:
      break;
  }
  return nullptr;
}

KeyTrack::Shape Controller::shapeOf(PropertyType type) {
  return type == Vec3Property  ? KeyTrack::Shape::Vector
         : type == RotProperty ? KeyTrack::Shape::Rotation
                               : KeyTrack::Shape::Scalar;
}

// --- editing ---

bool Controller::isEditable() const { return obstacleToKeys(*this) == Obstacle::none; }

void Controller::setLocked(bool locked) {
  recordSettings();
  m_locked = locked;
}

void Controller::beginDefaultEdit() { ++m_editDepth; }

void Controller::beginDataEdit(HTimeRange const&) { ++m_editDepth; }

void Controller::endDataEdit() {
  assert(m_editDepth > 0 && "an edit ends that did not begin");
  if (--m_editDepth == 0) changed();
}

void Controller::changed() {
  if (m_module) m_module->dataChanged(this);
}

bool Controller::areFinite(Values const& values, unsigned mask) const {
  bool const split = getPropertyType() == Vec3Property;
  for (int i = 0; i < static_cast<int>(shapeOf(getPropertyType())); ++i)
    if ((!split || mask >> i & 1) && !std::isfinite(values[static_cast<size_t>(i)])) return false;
  return true;
}

void Controller::setDefaultValues(Values const& values) {
  if (!areFinite(values, KeyTrack::kAll)) return;
  recordSettings();
  m_default = values;
  changed();
}

void Controller::writeKeyAt(int64 time, Values const& values, unsigned mask) {
  if (!areFinite(values, mask)) return;
  OwnEdit const edit(*this, HTimeRange(time, time));
  KeyTrack* track = editTrack(time, time);
  if (!track) return;
  // A new key of a one-valued or rotation channel is whole whatever the mask.
  track->set(time, values, track->shape() == KeyTrack::Shape::Vector ? mask : KeyTrack::kAll);
  changed();
}

void Controller::writeKey(int key, Values const& values, unsigned mask) {
  if (KeyTrack const* track = activeTrackWith(key)) writeKeyAt(track->timeAt(key), values, mask);
}

void Controller::readKey(int key, Values& values) const {
  KeyTrack const* track = activeTrackWith(key);
  values = track ? track->at(key).values : m_default;
}

int Controller::selectKeys(HTimeRange const& range, unsigned mask) {
  if (!findActiveTrack()) return 0;
  OwnEdit const edit(*this, range);
  return static_cast<int>(
      editTrack(range.getStart(), range.getEnd())->select(range.getStart(), range.getEnd(), mask));
}

int Controller::deselectKeys(HTimeRange const& range, unsigned mask) {
  if (!findActiveTrack()) return 0;
  OwnEdit const edit(*this, range);
  return static_cast<int>(
      editTrack(range.getStart(), range.getEnd())->deselect(range.getStart(), range.getEnd(), mask));
}

int64 Controller::getDataPeriod(NLEClip const& clip) const {
  int64 const frame = clip.getFramePeriod();
  auto const* taken = objectAs<Clip>(&clip);
  double const rate = taken ? taken->getFileTime().sampleRate : 0;
  if (!(rate > 0) || getPropertyType() != FloatProperty || !objectAs<AnalogDevice>(m_module)) return frame;
  // Samples that do not go with the frames are not at multiples of their period.
  int64 const sample = ticksPerFrameAt(rate);
  return frame % sample == 0 ? sample : frame;
}

KeyTrack::BridgeEnds Controller::bridgeEnds() const {
  return {m_interpolation, getDataPeriod(*getDatabase()->getActiveClip())};
}

int Controller::deleteKey(int64 time, unsigned mask) {
  return hasKeyAt(time) ? deleteKeys(HTimeRange(time, time), mask, false) : 0;
}

int Controller::deleteKeys(HTimeRange const& range, unsigned mask, bool allLayers) {
  OwnEdit const edit(*this, range);
  int64 deleted = 0;
  Database const& scene = *getDatabase();
  NLEClip* clip = scene.getActiveClip();
  int64 const first = range.getStart(), last = range.getEnd();
  bool bridged = false;  // data may go without a key
  for (ClipTrack const& track : m_tracks) {
    if (track.clip != clip || (track.layer != scene.getActiveLayer() &&
                               !(allLayers && obstacleToKeys(*this, clip, track.layer) == Obstacle::none)))
      continue;
    KeyTrack* edited = trackToDelete(clip, track.layer, first, last);
    bridged = bridged || edited->bridgesAny(mask);
    deleted += edited->deleteRange(first, last, mask, bridgeEnds());
  }
  if (deleted || bridged) changed();
  return static_cast<int>(deleted);
}

int Controller::deleteSelectedKeys(unsigned mask) {
  KeyTrack const* track = findActiveTrack();
  if (!track || track->countSelected() == 0) return 0;
  int64 const first = track->timeAt(track->selectedIndex(0));
  int64 const last = track->timeAt(track->selectedIndex(track->countSelected() - 1));
  OwnEdit const edit(*this, HTimeRange(first, last));
  NLEClip* clip = getDatabase()->getActiveClip();
  int const layer = getDatabase()->getActiveLayer();
  KeyTrack* edited = track->bridgesAny() ? &replaceTrack(clip, layer) : editTrack(first, last);
  int64 const deleted = edited->deleteSelected(mask, bridgeEnds());
  if (deleted) changed();
  return static_cast<int>(deleted);
}

void Controller::bridgeKeys(HTimeRange const& range, unsigned mask) {
  if (!findActiveTrack()) return;
  OwnEdit const edit(*this, range);
  editTrack(range.getStart(), range.getEnd())->bridge(range.getStart(), range.getEnd(), mask);
  changed();
}

bool Controller::copyFrom(Controller const* source, bool keys, bool selectionToo) {
  if (source->getPropertyType() != getPropertyType()) return false;
  NLEClip* clip = getDatabase()->getActiveClip();
  int const layers = clip ? clip->getNumLayers() : 0;
  auto const isFree = [&](int layer) { return obstacleToKeys(*this, clip, layer) == Obstacle::none; };
  int layer = 0;
  while (layer < layers && !isFree(layer)) ++layer;
  if (layer == layers) return false;
  if (source == this) return true;
  setDefaultValues(source->m_default);
  setInterpType(static_cast<int>(source->m_interpolation));
  for (layer = 0; keys && layer < layers; ++layer) {
    KeyTrack const* theirs = source->findTrack(clip, layer);
    if (!theirs && !findTrack(clip, layer)) continue;
    if (!isFree(layer)) {
      getDatabase()->logWarning("%s is not editable on %s in layer %d of %s: %s.", getName().GetStr(),
                                m_module->getName().GetStr(), layer, clip->getName().GetStr(),
                                reasonOf(Obstacle::layerLocked));
      continue;
    }
    KeyTrack copy = theirs ? *theirs : KeyTrack(shapeOf(getPropertyType()));
    if (!selectionToo) copy.deselect(-kForever, kForever);
    setTrack(clip, layer, std::move(copy));
  }
  return true;
}

// --- keys of the active layer ---

namespace {

int asInt(int64 count) { return static_cast<int>(std::min<int64>(count, INT_MAX)); }

}  // namespace

Controller::ClipTrack const* Controller::find(NLEClip const* clip, int layer) const {
  for (ClipTrack const& track : m_tracks)
    if (track.clip == clip && track.layer == layer) return &track;
  return nullptr;
}

KeyTrack const* Controller::findTrack(NLEClip const* clip, int layer) const {
  ClipTrack const* track = find(clip, layer);
  return track ? &track->track : nullptr;
}

KeyTrack const* Controller::findActiveTrack() const {
  Database const& scene = *getDatabase();
  NLEClip const* clip = scene.getActiveClip();
  return clip ? findTrack(clip, scene.getActiveLayer()) : nullptr;
}

KeyTrack const* Controller::activeTrackWith(int key) const {
  KeyTrack const* track = findActiveTrack();
  return track && key >= 0 && key < track->count() ? track : nullptr;
}

KeyTrack const* Controller::findDataTrack(NLEClip const* clip) const {
  for (int layer = 0; clip && layer < clip->getNumLayers(); ++layer)
    if (KeyTrack const* track = findTrack(clip, layer); track && !track->empty()) return track;
  return nullptr;
}

bool Controller::isMeasured() const {
  if (auto const* marker = objectAs<Marker>(m_module)) return marker->getTranslationChannel() == this;
  return objectAs<AnalogDevice>(m_module) != nullptr;
}

int Controller::getNumKeys() const {
  KeyTrack const* track = findActiveTrack();
  return track ? asInt(track->count()) : 0;
}

int Controller::getNumKeys(unsigned mask) const {
  KeyTrack const* track = findActiveTrack();
  return track ? asInt(track->countHolding(mask)) : 0;
}

int Controller::getNumSelectedKeys() const {
  KeyTrack const* track = findActiveTrack();
  return track ? asInt(track->countSelected()) : 0;
}

int Controller::getNumSelectedKeys(unsigned mask) const {
  KeyTrack const* track = findActiveTrack();
  return track ? asInt(track->countSelected(mask)) : 0;
}

int Controller::getSelectedKeyIndex(int i) const {
  KeyTrack const* track = findActiveTrack();
  return track && i >= 0 && i < track->countSelected() ? asInt(track->selectedIndex(i)) : -1;
}

unsigned Controller::getSelectedKeyFlags(int i) const {
  int const key = getSelectedKeyIndex(i);
  return key < 0 ? 0 : findActiveTrack()->at(key).selected;
}

int64 Controller::getKeyTime(int key) const {
  KeyTrack const* track = activeTrackWith(key);
  return track ? track->timeAt(key) : 0;
}

bool Controller::keyHasComponents(int key, unsigned mask) const {
  KeyTrack const* track = activeTrackWith(key);
  return track && (track->at(key).components & mask) == mask;
}

bool Controller::hasKeyAt(int64 time) const {
  KeyTrack const* track = findActiveTrack();
  return track && track->find(time) >= 0;
}

bool Controller::hasKeyAt(int64 time, unsigned mask) const {
  KeyTrack const* track = findActiveTrack();
  int64 const key = track ? track->find(time) : -1;
  return key >= 0 && (track->at(key).components & mask) == mask;
}

bool Controller::isKeySelectedAt(int64 time, unsigned mask) const {
  KeyTrack const* track = findActiveTrack();
  int64 const key = track ? track->find(time) : -1;
  return key >= 0 && (track->at(key).selected & mask) != 0;
}

HTimeRange Controller::getKeyRange() const {
  KeyTrack const* track = findActiveTrack();
  return track && !track->empty() ? HTimeRange(track->timeAt(0), track->timeAt(track->count() - 1))
                                  : HTimeRange();
}

// --- evaluation ---

void Controller::evaluate(int64 time, Values& values) const {
  Database const& scene = *getDatabase();
  scene.checkThread();
  NLEClip const* clip = scene.getActiveClip();
  values = m_default;
  if (!clip || m_tracks.empty()) return;
  if (clip->holdsKeys()) return evaluateInClip(clip, time, values);

  // A blend: the mean of its sources, weighted by their weights now.
  MultiModAttribute const* sources = static_cast<BlendClip const*>(clip)->getSources();
  std::vector<Values> parts;
  std::vector<double> weights;
  double sum = 0;
  for (int i = 0; i < sources->getNumModules(); ++i) {
    auto const* source = objectAs<NLEClip>(sources->getModuleValue(i));
    if (!source || !source->holdsKeys()) continue;
    Values weight;
    source->getWeightChannel()->evaluateInClip(source, time, weight = source->getWeightChannel()->m_default);
    if (!(weight[0] > 0)) continue;
    evaluateInClip(source, time, parts.emplace_back(m_default));
    weights.push_back(weight[0]);
    sum += weight[0];
  }
  if (parts.empty()) return;
  for (double& weight : weights) weight /= sum;
  blend(parts.data(), weights.data(), static_cast<int>(parts.size()), values);
}

bool Controller::evaluateLayer(NLEClip const* clip, int layer, int64 time, Values& values) const {
  ClipTrack const* track = find(clip, layer);
  Values const otherwise = layer == 0 ? m_default : neutral();
  if (!track || track->track.empty()) {
    values = otherwise;
    return layer == 0;
  }
  track->track.evaluate(time, m_interpolation, otherwise, values, &track->cursor);
  return true;
}

void Controller::evaluateInClip(NLEClip const* clip, int64 time, Values& values) const {
  evaluateLayer(clip, 0, time, values);
  int const layers = clip->getNumLayers();
  Values added;
  for (int layer = 1; layer < layers; ++layer)
    if (evaluateLayer(clip, layer, time, added)) compose(values, added);
}

void Controller::evaluateLayer(int64 time, Values& values) const {
  Database const& scene = *getDatabase();
  scene.checkThread();
  NLEClip const* clip = scene.getActiveClip();
  clip ? static_cast<void>(evaluateLayer(clip, scene.getActiveLayer(), time, values))
       : static_cast<void>(values = m_default);
}

Controller::Values Controller::solveLayer(int64 time, Values const& wanted) const {
  // A clip of one layer takes the value as it is, without the rounding of a sum.
  NLEClip const* clip = getDatabase()->getActiveClip();
  bool const single = !clip || clip->getNumLayers() == 1;
  Values all, own;
  evaluate(time, all);
  evaluateLayer(time, own);
  for (size_t i = 0; i < own.size(); ++i) own[i] = single ? wanted[i] : own[i] + wanted[i] - all[i];
  return own;
}

void Controller::compose(Values& values, Values const& layer) const {
  for (size_t i = 0; i < values.size(); ++i) values[i] += layer[i];
}

void Controller::blend(Values const* values, double const* weights, int count, Values& out) const {
  out = Values{};
  for (int i = 0; i < count; ++i)
    for (size_t k = 0; k < out.size(); ++k) out[k] += weights[i] * values[i][k];
}

// --- interpolation ---

int Controller::getNumInterpTypes() const { return m_numInterpTypes; }

char const* Controller::getInterpTypeName(int i) const {
  static constexpr char const* names[] = {"Constant", "Linear", "Cubic"};
  return i >= 0 && i < m_numInterpTypes ? names[i] : nullptr;
}

void Controller::setInterpType(int i) {
  if (i < 0 || i >= m_numInterpTypes) return;
  recordSettings();
  m_interpolation = static_cast<Interpolation>(i);
  changed();
}

// --- clips and layers ---

void Controller::setTrack(NLEClip* clip, int layer, KeyTrack track) {
  OwnEdit const edit(*this);
  assert(track.shape() == shapeOf(getPropertyType()));
  replaceTrack(clip, layer) = std::move(track);
  changed();
}

bool Controller::hasKeysInClip(NLEClip const* clip) const {
  return std::any_of(m_tracks.begin(), m_tracks.end(),
                     [&](ClipTrack const& track) { return track.clip == clip && !track.track.empty(); });
}

HTimeRange Controller::getKeyRangeInClip(NLEClip const* clip) const {
  HTimeRange range;
  for (ClipTrack const& track : m_tracks) {
    if (track.clip != clip || track.track.empty()) continue;
    range.include(HTimeRange(track.track.timeAt(0), track.track.timeAt(track.track.count() - 1)));
  }
  return range;
}

void Controller::forgetClip(NLEClip const* clip) {
  std::vector<ClipTrack> others;
  std::copy_if(m_tracks.begin(), m_tracks.end(), std::back_inserter(others),
               [&](ClipTrack const& track) { return track.clip != clip; });
  if (others.size() == m_tracks.size()) return;
  OwnEdit const edit(*this);
  storeTracks(std::move(others));
}

// But for the keys in clips that have left the scene meanwhile.
void Controller::restore(State const& state) {
  OwnEdit const edit(*this);
  std::vector<ClipTrack> tracks = state.tracks;
  std::erase_if(tracks, [this](ClipTrack const& track) {
    NLEClip const* clip = getDatabase()->getHeadClip();
    while (clip && clip != track.clip) clip = clip->getNext();
    return !clip;
  });
  storeTracks(std::move(tracks));
  setDefaultValues(state.byDefault);
  setInterpType(static_cast<int>(state.interpolation));
}
