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
  explicit PointExport(TakeExport& out) : m_out(out), m_sampler(*out.sampler), m_world(out.sampler) {}

  void add(Marker const& marker) {
    Controller const& translation = *marker.getTranslationChannel();
    if (!m_sampler.belongsToClip(translation)) return;
    PointSource point;
    point.label = marker.getName().GetString();
    if (marker.isUnlabeled() && standsForNoName(point.label)) point.label.clear();
    point.subject = subjectOf(marker);
    point.description = fileMetadata::text(marker, fileMetadata::kDescription);
    m_out.keysLeftOut += m_sampler.keysOffGrid(translation);

    Controller const& residual = *marker.getResidualChannel();
    bool const inWorld = !hasPreTransform(marker) && isWorldSpace(m_sampler, marker.getNodeParent());
    point.positions = inWorld ? channelSource(m_out.sampler, translation, {&translation})
                              : m_world.positions(marker, &translation);
    if (m_sampler.hasKeys(residual))
      point.residuals = channelSource(m_out.sampler, residual, {&residual, &translation});
    Controller const* cameras = marker.getChannel("Cameras");
    if (cameras && cameras->getPropertyType() == DataSource::IntProperty && m_sampler.dataTrack(*cameras))
      point.cameras = channelSource(m_out.sampler, *cameras, {cameras});
    m_out.take.points.push_back(std::move(point));
  }

 private:
  TakeExport& m_out;
  FrameSampler const& m_sampler;
  WorldSources m_world;
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
