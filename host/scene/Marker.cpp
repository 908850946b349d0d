#include "host/scene/Marker.h"

#include <cmath>

#include "host/scene/Character.h"
#include "host/scene/Database.h"
#include "host/scene/HTimeManager.h"

H_DEFINE_CLASS(Marker);

void Marker::setUp() {
  Node::setUp();
  m_occluded = static_cast<BoolController*>(addChannel("Occluded", DataSource::BoolProperty));
  m_residual = static_cast<FloatController*>(addChannel("Residual", DataSource::FloatProperty));
}

Marker* Marker::createInstance() {
  auto* marker = new Marker;
  marker->setUp();
  return marker;
}

namespace {

int64 frameBehind(Database const& scene, int64 time) {
  return scene.getTimeManager()->frameTime(time + 1, HTimeManager::RoundUp, 0);
}

}  // namespace

bool Marker::isUnlabeled() const { return getCharacterParent() == nullptr; }

void Marker::setFillType(int64 const& time, EFillType const& type, bool) {
  NLEClip const* clip = getDatabase()->getActiveClip();
  if (!clip || !clip->holdsKeys() || isLocked()) return;
  Controller* channel = addChannel("FillType", DataSource::IntProperty);
  if (!channel || !channel->isEditable()) return;
  // The rest of a reduced run stays one, but where recorded data says that it ends.
  const int64 next = frameBehind(*getDatabase(), time);
  const bool goesOn =
      type != Reduced && type != Recorded && isReducedBehind(time) && !channel->hasKeyAt(next);
  channel->beginDataEdit(HTimeRange(time - 1, next));
  static_cast<IntController*>(channel)->setKey(time, type, KeyTrack::kAll);
  if (goesOn) static_cast<IntController*>(channel)->setKey(next, Reduced, KeyTrack::kAll);
  channel->endDataEdit();
}

bool Marker::isReducedBehind(int64 time) const {
  NLEClip const* clip = getDatabase()->getActiveClip();
  Controller const* channel = getChannel("FillType");
  const int64 frame = frameBehind(*getDatabase(), time);
  int64 latest = -kForever - 1;
  double type = Recorded;
  for (int layer = clip && channel ? clip->getNumLayers() : 0; layer-- > 0;) {
    KeyTrack const* track = channel->findTrack(clip, layer);
    const int64 key = track ? track->lowerBound(frame + 1) - 1 : -1;
    if (key < 0 || track->timeAt(key) <= latest) continue;
    latest = track->timeAt(key);
    type = track->at(key).values[0];
  }
  return std::lround(type) == Reduced;
}

// Each key speaks for its own time only: without one the data was recorded. Fill types of layers do not add
// up, the highest layer's says.
Marker::EFillType Marker::getFillType(int64 time) const {
  NLEClip const* clip = getDatabase()->getActiveClip();
  Controller const* channel = getChannel("FillType");
  for (int layer = clip && channel ? clip->getNumLayers() : 0; layer-- > 0;) {
    KeyTrack const* track = channel->findTrack(clip, layer);
    const int64 key = track ? track->find(time) : -1;
    if (key >= 0) return static_cast<EFillType>(std::lround(track->at(key).values[0]));
  }
  return Recorded;
}
