#include "host/scene/Marker.h"

#include <cmath>

#include "host/keys/DataRanges.h"
#include "host/scene/Character.h"
#include "host/scene/Database.h"

H_DEFINE_CLASS(Marker);

namespace {

class OccludedController final : public BoolController {
 public:
  void evaluate(int64 time, Values& values) const override {
    auto const* marker = objectAs<Marker>(getModule());
    if (marker && !marker->isSeenAt(time)) {
      values = {1};
    } else {
      BoolController::evaluate(time, values);
    }
  }
};

}  // namespace

void Marker::setUp() {
  Node::setUp();
  m_occluded = static_cast<BoolController*>(addChannel("Occluded", std::make_unique<OccludedController>()));
  m_residual = static_cast<FloatController*>(addChannel("Residual", DataSource::FloatProperty));
  m_fillType = static_cast<IntController*>(addChannel("FillType", DataSource::IntProperty));
}

Marker* Marker::createInstance() {
  auto* marker = new Marker;
  marker->setUp();
  return marker;
}

bool Marker::isUnlabeled() const { return getCharacterParent() == nullptr; }

void Marker::setFillType(int64 const& time, EFillType const& type, bool) {
  if (!m_fillType->isEditable()) return;
  m_fillType->beginDataEdit(HTimeRange(time, time));
  m_fillType->setKey(time, type, KeyTrack::kAll);
  m_fillType->endDataEdit();
}

bool Marker::isSeenAt(int64 time) const {
  NLEClip const* clip = getDatabase()->getActiveClip();
  if (!clip || !clip->holdsKeys()) return true;
  KeyTrack const* track = getTranslationChannel()->findDataTrack(clip);
  return track && DataRanges(*track, 1, KeyTrack::kAll, DataRanges::Where::All).hasDataAt(time);
}

// Each key speaks for its own time, and as far as it is bridged: without one the data was recorded. Fill
// types of layers do not add up, the highest layer's says.
Marker::EFillType Marker::getFillType(int64 time) const {
  NLEClip const* clip = getDatabase()->getActiveClip();
  for (int layer = clip ? clip->getNumLayers() : 0; layer-- > 0;) {
    KeyTrack const* track = m_fillType->findTrack(clip, layer);
    if (!track || !DataRanges(*track, 1).hasDataAt(time)) continue;
    KeyTrack::Values values{};
    track->evaluate(time, Interpolation::Constant, {}, values);
    return static_cast<EFillType>(std::lround(values[0]));
  }
  return Recorded;
}
