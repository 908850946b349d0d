// Removing keys that a channel's curve does not need.
#include <algorithm>
#include <cmath>

#include "host/keys/KeyReduction.h"
#include "host/scene/Clips.h"
#include "host/scene/Controller.h"
#include "host/scene/Database.h"
#include "host/services/HInterface.h"

namespace {

bool isLength(Controller const& channel) {
  HString const name = channel.getName();
  return name == "Translation" || name == "Length" || name == "Residual";
}

double toleranceFor(Controller const& channel, KeyTrack const& track, ReductionTolerances const& tolerances) {
  if (channel.getPropertyType() == DataSource::RotProperty) return tolerances.angle;
  return isLength(channel) ? tolerances.length : tolerances.ofRange * valueRange(track);
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
        auto const range = std::partition_point(
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
  int const layer = scene.getActiveLayer();
  KeyTrack const* active = findActiveTrack();
  if (!active || !clip->holdsKeys()) return 0;

  KeyTrack const original = *active;
  ReductionRule const rule{.interpolation = m_interpolation,
                           .tolerance = toleranceFor(*this, original, tolerances),
                           .framePeriod = bridgeEnds().framePeriod,
                           .isWhole = getPropertyType() == IntProperty,
                           .mayGo = std::move(mayGo),
                           .hasGaps = isMeasured() && findDataTrack(clip) == active};
  KeyTrack reduced = original;
  int64 const removed = reduced.thin(redundantKeys(original, rule));
  if (removed == 0) return 0;
  setTrack(clip, layer, std::move(reduced));
  return static_cast<int>(removed);
}
