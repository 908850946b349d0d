// Removing keys that a channel's curve does not need.
#include <algorithm>
#include <cmath>

#include "host/keys/KeyReduction.h"
#include "host/scene/Clips.h"
#include "host/scene/Controller.h"
#include "host/scene/Database.h"
#include "host/scene/Devices.h"
#include "host/scene/HTimeManager.h"
#include "host/scene/MarkerRuns.h"
#include "host/services/HInterface.h"

namespace {

bool isLength(Controller const& channel) {
  const HString name = channel.getName();
  return name == "Translation" || name == "Length" || name == "Residual";
}

double toleranceFor(Controller const& channel, KeyTrack const& track, ReductionTolerances const& tolerances) {
  if (channel.getPropertyType() == DataSource::RotProperty) return tolerances.angle;
  return isLength(channel) ? tolerances.length : tolerances.ofRange * valueRange(track);
}

// The marker whose occlusion the keys of this layer tell: those of its positions, in the lowest layer that
// has any. Null for all other keys.
Marker* markerSeenBy(Controller const& channel, NLEClip const* clip, int layer) {
  auto* marker = objectAs<Marker>(channel.getModule());
  if (!marker || marker->getTranslationChannel() != &channel) return nullptr;
  while (layer-- > 0)
    if (KeyTrack const* lower = channel.findTrack(clip, layer); lower && !lower->empty()) return nullptr;
  return marker;
}

}  // namespace

ReductionTolerances ReductionTolerances::fromProfile() {
  return {.length = g_interface->getProfile(profile::kReductionLength),
          .angle = g_interface->getProfile(profile::kReductionAngle) * M_PI / 180,
          .ofRange = g_interface->getProfile(profile::kReductionPercent) / 100};
}

int Controller::reduceKeys(std::span<HTimeRange const> ranges, ReductionTolerances const& tolerances) {
  return reduce(
      [&](KeyTrack::Key const& key) {
        const auto range = std::partition_point(
            ranges.begin(), ranges.end(), [&](HTimeRange const& each) { return each.getEnd() < key.time; });
        return range != ranges.end() && range->contains(key.time);
      },
      tolerances);
}

int Controller::reduceSelectedKeys(ReductionTolerances const& tolerances) {
  return reduce([](KeyTrack::Key const& key) { return key.selected != 0; }, tolerances);
}

int Controller::reduce(std::function<bool(KeyTrack::Key const&)> mayGo,
                       ReductionTolerances const& tolerances) {
  Database const& scene = *getDatabase();
  NLEClip* clip = scene.getActiveClip();
  const int layer = scene.getActiveLayer();
  KeyTrack const* active = findActiveTrack();
  if (!active || !clip->holdsKeys()) return 0;

  const KeyTrack original = *active;
  Marker* marker = markerSeenBy(*this, clip, layer);
  ReductionRule rule{.interpolation = m_interpolation,
                     .tolerance = toleranceFor(*this, original, tolerances),
                     .framePeriod = scene.getTimeManager()->getTicksPerFrame(),
                     .isWhole = getPropertyType() == IntProperty,
                     .mayGo = std::move(mayGo),
                     .hasGaps = marker || objectAs<AnalogDevice>(m_module)};
  if (marker) rule.isBridged = [marker](int64 time) { return marker->isReducedBehind(time); };
  KeyTrack reduced = original;
  const int64 removed = eraseComponents(reduced, redundantKeys(original, rule));
  if (removed == 0) return 0;
  if (marker) markReduced(*marker, clip, layer, original, reduced);
  setTrack(clip, layer, std::move(reduced));
  return static_cast<int>(removed);
}
