#include <algorithm>

#include "io/scene/FileMetadata.h"
#include "io/scene/TakeImportParts.h"

namespace talix {

namespace {

bool isMarker(Module const& module) { return module.isKindOf(&Marker::staticClass()); }

// The masks that are not empty as keys; runs of equal ones take hardly any room.
KeyTrack cameraTrack(std::vector<unsigned char> const& cameras, int64 start, int64 period) {
  KeyTrack track(KeyTrack::Shape::Scalar);
  std::vector<double> run;
  for (size_t i = 0; i < cameras.size();) {
    if (cameras[i] == 0) {
      ++i;
      continue;
    }
    size_t const first = i;
    run.clear();
    while (i < cameras.size() && cameras[i] != 0) run.push_back(cameras[i++]);
    track.append(start + static_cast<int64>(first) * period, period, run.data(),
                 static_cast<int64>(run.size()));
  }
  return track;
}

class PointImport {
 public:
  PointImport(TakeImport& import, Take const& take)
      : m_import(import), m_take(take), m_period(ticksPerFrameAt(take.rate)) {}

  void add(TakePoint& point) {
    Marker* marker = markerFor(point);
    FileToParent const& toParent = spaceBelow(marker->getNodeParent());
    if (!toParent.isIdentity())
      point.positions.transform([&](double* values) { toParent.position(Vec3(values)).getValue(values); });
    NLEClip* clip = &m_import.clip();
    // A point that was never seen has a track as well: so it is known to belong to the clip.
    marker->getTranslationChannel()->setTrack(clip, 0, std::move(point.positions));
    if (!point.residuals.empty()) marker->getResidualChannel()->setTrack(clip, 0, std::move(point.residuals));
    addCameras(*marker, point);
    if (!point.description.empty())
      fileMetadata::setText(*marker, fileMetadata::kDescription, point.description);
  }

  void addNotes() {
    if (m_unlabeled)
      m_import.info(counted(m_unlabeled, "point") + " without a label became " +
                    (m_unlabeled == 1 ? "a marker" : "markers") + " at the root");
    if (m_mended) m_import.info(counted(m_mended, "name") + " held a backslash, which became \"_\"");
    if (m_noCameras)
      m_import.warn("the camera masks of " + counted(m_noCameras, "point") +
                    " were left out: the scene has another channel named \"Cameras\"");
  }

 private:
  Marker* markerFor(TakePoint const& point) {
    if (point.label.empty()) {
      ++m_unlabeled;
      return m_import.placeUnlabeled();
    }
    Character* subject = point.subject.empty() ? m_import.fileCharacter(m_take.name)
                                               : m_import.character(mended(point.subject));
    return m_import.place<Marker>(isMarker, mended(point.label), subject);
  }

  std::string mended(std::string const& name) {
    std::string result = moduleName(name);
    m_mended += result != name;
    return result;
  }

  FileToParent const& spaceBelow(Node* parent) {
    auto const found = m_spaces.find(parent);
    return found != m_spaces.end()
               ? found->second
               : m_spaces.emplace(parent, FileToParent(m_import.turn(), parent)).first->second;
  }

  void addCameras(Marker& marker, TakePoint const& point) {
    KeyTrack track = cameraTrack(point.cameras, m_take.firstFrame * m_period, m_period);
    if (track.empty()) return;
    if (Controller* channel = marker.addChannel("Cameras", DataSource::IntProperty))
      channel->setTrack(&m_import.clip(), 0, std::move(track));
    else
      ++m_noCameras;
  }

  TakeImport& m_import;
  Take const& m_take;
  int64 m_period;
  std::unordered_map<Node*, FileToParent> m_spaces;
  int64 m_unlabeled = 0, m_mended = 0, m_noCameras = 0;
};

}  // namespace

void importPoints(TakeImport& import, Take& take) {
  PointImport points(import, take);
  for (TakePoint& point : take.points) points.add(point);
  points.addNotes();
}

}  // namespace talix
