#include <cctype>
#include <cmath>
#include <string_view>

#include "host/scene/Character.h"
#include "host/scene/Marker.h"
#include "io/scene/FileMetadata.h"
#include "io/scene/TakeExportParts.h"
#include "io/scene/UpAxisConversion.h"

namespace talix {

namespace {

bool isStill(FrameSampler const& sampler, Node const& node) {
  return !sampler.mayChange(*node.getTranslationChannel()) &&
         !sampler.mayChange(*node.getRotationChannel()) && !sampler.mayChange(*node.getScaleChannel());
}

bool hasPreTransform(Node const& node) {
  return !(node.getPreTranslation() == Vec3()) || !isNoRotation(node.getPreRotation());
}

// The name that a marker without a label gets when it is imported: "unlabeled", "unlabeled_1" ...
bool standsForNoName(std::string_view name) {
  constexpr std::string_view kUnlabeled = "unlabeled";
  if (!name.starts_with(kUnlabeled)) return false;
  name.remove_prefix(kUnlabeled.size());
  if (name.empty()) return true;
  if (name.size() < 2 || name[0] != '_') return false;
  for (char const c : name.substr(1))
    if (!std::isdigit(static_cast<unsigned char>(c))) return false;
  return true;
}

std::string subjectOf(Marker const& marker) {
  Character const* character = marker.getCharacterParent();
  if (!character) return {};
  std::string const name = character->getName().GetString();
  return fileMetadata::text(*character, fileMetadata::kFileName) == name ? std::string() : name;
}

class PointExport {
 public:
  explicit PointExport(TakeExport& out) : m_out(out), m_sampler(out.sampler) {}

  void add(Marker const& marker) {
    Controller const& translation = *marker.getTranslationChannel();
    if (!m_sampler.belongsToClip(translation)) return;
    TakePoint point;
    point.label = marker.getName().GetString();
    if (marker.isUnlabeled() && standsForNoName(point.label)) point.label.clear();
    point.subject = subjectOf(marker);
    point.description = fileMetadata::text(marker, fileMetadata::kDescription);
    m_out.keysLeftOut += m_sampler.keysOffGrid(translation);

    std::vector<bool> const frames = m_sampler.framesWithData(translation);
    point.positions = positions(marker, frames);
    if (m_sampler.hasKeys(*marker.getResidualChannel())) point.residuals = residuals(marker, frames);
    point.cameras = cameras(marker);
    m_out.take.points.push_back(std::move(point));
  }

 private:
  KeyTrack positions(Marker const& marker, std::vector<bool> const& frames) const {
    Controller const& translation = *marker.getTranslationChannel();
    if (!hasPreTransform(marker) && isWorldSpace(m_sampler, marker.getNodeParent())) {
      KeyTrack const* track = m_sampler.asItIs(translation);
      auto const seen = std::count(frames.begin(), frames.end(), true);
      return track && track->count() == seen ? *track : m_sampler.sampleWhere(frames, translation);
    }
    FrameGrid const& grid = m_sampler.grid();
    FrameRun run(KeyTrack::Shape::Vector, grid);
    for (int64 i = 0; i < grid.count; ++i) {
      if (!frames[static_cast<size_t>(i)]) continue;
      Vec3 const position = marker.getWSPos(grid.start() + i * grid.period);
      run.add(i, &position.x);
    }
    return run.take();
  }

  // Where there is a position, and a residual was recorded.
  KeyTrack residuals(Marker const& marker, std::vector<bool> const& positioned) const {
    Controller const& residual = *marker.getResidualChannel();
    std::vector<bool> frames = m_sampler.framesWithData(residual);
    bool allPositioned = true;
    for (size_t i = 0; i < frames.size(); ++i) {
      allPositioned = allPositioned && (positioned[i] || !frames[i]);
      frames[i] = frames[i] && positioned[i];
    }
    KeyTrack const* track = allPositioned ? m_sampler.asItIs(residual) : nullptr;
    return track ? *track : m_sampler.sampleWhere(frames, residual);
  }

  std::vector<unsigned char> cameras(Marker const& marker) const {
    Controller const* channel = marker.getChannel("Cameras");
    KeyTrack const* track = channel ? m_sampler.dataTrack(*channel) : nullptr;
    if (!track || channel->getPropertyType() != DataSource::IntProperty) return {};
    FrameGrid const& grid = m_sampler.grid();
    KeyTrack const known = m_sampler.sampleWhere(m_sampler.framesWithData(*channel), *channel);
    std::vector<unsigned char> masks(static_cast<size_t>(grid.count));
    known.forEach(0, known.count(), [&](KeyTrack::Key const& key) {
      masks[static_cast<size_t>((key.time - grid.start()) / grid.period)] =
          static_cast<unsigned char>(std::lround(key.values[0]));
    });
    return masks;
  }

  TakeExport& m_out;
  FrameSampler const& m_sampler;
};

}  // namespace

bool isWorldSpace(FrameSampler const& sampler, Node const* node) {
  for (; node; node = node->getNodeParent()) {
    bool const still = isStill(sampler, *node) && !hasPreTransform(*node) &&
                       node->getConstLocalPos() == Vec3() && isNoRotation(node->getConstLocalRot(true)) &&
                       node->getConstLocalScale() == Vec3(1, 1, 1);
    if (!still) return false;
  }
  return true;
}

void exportPoints(TakeExport& out) {
  PointExport points(out);
  for (int i = 0; i < out.scene.getNumNodes(); ++i)
    if (auto const* marker = objectAs<Marker>(out.scene.getNode(i))) points.add(*marker);
}

}  // namespace talix
