#include "host/scene/Marker.h"

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
  Controller* channel = addChannel("FillType", DataSource::IntProperty);
  channel->beginDataEdit(HTimeRange(time - 1, time + 1));
  static_cast<IntController*>(channel)->setKey(time, type, KeyTrack::kAll);
  channel->endDataEdit();
}

// Each key speaks for its own time only: without one the data was recorded.
Marker::EFillType Marker::getFillType(int64 time) const {
  auto const* channel = static_cast<IntController const*>(getChannel("FillType"));
  return channel && channel->hasKeyAt(time) ? static_cast<EFillType>(channel->getValue(time)) : Recorded;
}
