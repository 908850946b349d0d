#include "host/scene/Marker.h"

#include <cmath>

#include "host/scene/Character.h"
#include "host/scene/Database.h"

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

bool Marker::isUnlabeled() const { return getCharacterParent() == nullptr; }

void Marker::setFillType(int64 const& time, EFillType const& type, bool) {
  NLEClip const* clip = g_db->getActiveClip();
  if (!clip || !clip->holdsKeys() || isLocked()) return;
  Controller* channel = addChannel("FillType", DataSource::IntProperty);
  if (!channel || !channel->isEditable()) return;
  channel->beginDataEdit(HTimeRange(time - 1, time + 1));
  static_cast<IntController*>(channel)->setKey(time, type, KeyTrack::kAll);
  channel->endDataEdit();
}

// Each key speaks for its own time only: without one the data was recorded. Fill types of layers do not add
// up, the highest layer's says.
Marker::EFillType Marker::getFillType(int64 time) const {
  NLEClip const* clip = g_db->getActiveClip();
  Controller const* channel = getChannel("FillType");
  for (int layer = clip && channel ? clip->getNumLayers() : 0; layer-- > 0;) {
    KeyTrack const* track = channel->findTrack(clip, layer);
    const int64 key = track ? track->find(time) : -1;
    if (key >= 0) return static_cast<EFillType>(std::lround(track->at(key).values[0]));
  }
  return Recorded;
}
