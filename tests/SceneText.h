// The whole scene as text, completely and in one order: what undo has to restore. Not in it: current time,
// the priority module.
#pragma once

#include <iomanip>
#include <sstream>
#include <string>

#include "host/scene/CalibrationMgr.h"
#include "host/scene/Database.h"
#include "host/scene/HTimeManager.h"
#include "host/scene/PropertyTable.h"
#include "host/scene/SubjectManager.h"

namespace talix_tests {

class SceneText {
 public:
  explicit SceneText(Database& scene = *g_db) : m_scene(scene) {}

  std::string write() {
    m_out.str("");
    m_out << std::setprecision(17);
    writeSettings();
    for (int i = 0; i < m_scene.getNumModules(); ++i) writeModule(*m_scene.getModule(i));
    return m_out.str();
  }

 private:
  static std::string name(Module const* module) {
    return module ? module->getName().GetString() + "#" + std::to_string(module->getID().getNumber())
                  : "none";
  }

  void writeSettings() {
    HTimeManager const& time = *m_scene.getTimeManager();
    m_out << "rate " << time.getTicksPerFrame() << " up " << m_scene.getUpAxis() << "\nranges";
    auto const range = [this](HTimeRange const& each) {
      m_out << " " << each.getStart() << "-" << each.getEnd();
    };
    range(time.getPlayRange());
    range(time.getAnimRange());
    for (int i = 0; i < time.getNumSelectedRanges(); ++i) range(time.getSelectedTimeRange(i));
    m_out << "\nselected";
    for (int i = 0; i < m_scene.getNumSelectedModules(); ++i)
      m_out << " " << name(m_scene.getSelectedModule(i));
    m_out << "\nselected nodes";
    for (int i = 0; i < m_scene.getNumSelectedNodes(); ++i) m_out << " " << name(m_scene.getSelectedNode(i));
    m_out << "\nselected markers";
    for (int i = 0; i < m_scene.getNumSelectedMarkers(); ++i)
      m_out << " " << name(m_scene.getSelectedMarker(i));
    m_out << "\nprimary " << name(m_scene.getPrimarySelectedModule()) << "\nactive "
          << name(m_scene.getActiveClip()) << " " << m_scene.getActiveLayer();
    for (int i = 0; i < m_scene.getNumActiveProperties(); ++i) m_out << " " << m_scene.getActiveProperty(i);
    m_out << "\nclips";
    for (NLEClip* clip = m_scene.getHeadClip(); clip; clip = clip->getNext()) {
      m_out << " " << name(clip) << ":";
      for (int layer = 0; layer < clip->getNumLayers(); ++layer) m_out << clip->isLayerLocked(layer);
      if (auto const* own = objectAs<Clip>(clip))
        m_out << " " << own->getFileTime().rate << " " << own->getFileTime().firstFrame << " "
              << own->getFileTime().frameCount << " " << own->getFileTime().sampleRate;
    }
    m_out << "\nnodes";
    for (int i = 0; i < m_scene.getNumNodes(); ++i) m_out << " " << name(m_scene.getNode(i));
    m_out << "\nsubjects";
    for (uint64 i = 0; i < m_scene.getSubjectManager()->getNumSubjects(); ++i)
      m_out << " " << name(m_scene.getSubjectManager()->getSubject(i));
    m_out << "\nchannel names";
    PropertyTable const& table = m_scene.getPropertyTable();
    for (unsigned id = 1; table.getType(id) != DataSource::NoProperty; ++id)
      m_out << " " << table.getName(id).GetStr() << ":" << table.getType(id);
    m_out << "\n";
  }

  void writeModule(Module const& module) {
    HString const path = module.getFullPathString();
    m_out << path.GetStr() << " " << name(&module) << " " << module.getRuntimeClass()->getName() << " below "
          << name(module.getParent()) << (module.isSelected() ? " selected" : "")
          << (m_scene.getModuleWithPath(path, nullptr, false) ? "" : " not found by its path")
          << "\n children";
    for (int i = 0; i < module.getNumChildren(); ++i) m_out << " " << name(module.getChild(i));
    for (int i = 0; i < module.getNumNodeChildren(); ++i) m_out << " " << name(module.getNodeChild(i));
    for (int i = 0; i < module.getNumMarkerChildren(); ++i) m_out << " " << name(module.getMarkerChild(i));
    m_out << "\n";
    for (int i = 0; i < module.getNumAttributes(); ++i) writeAttribute(*module.getAttribute(i));
    for (int i = 0; i < module.getNumChannels(); ++i) writeChannel(*module.getChannel(i));
    if (auto const* node = objectAs<Node>(&module)) writeNode(*node);
  }

  void writeAttribute(Attribute const& attribute) {
    m_out << " " << attribute.getName().GetStr() << "#" << attribute.getID().getNumber() << " "
          << (attribute.isSet() ? "" : "(not set) ");
    std::visit([this](auto const& value) { write(value); }, attribute.getRawValue());
    m_out << "\n";
  }
  void write(std::monostate) {}
  void write(HString const& text) { m_out << text.GetStr(); }
  void write(Vec3 const& v) { m_out << v.x << " " << v.y << " " << v.z; }
  void write(Attribute::Bits const& bits) {
    for (bool const bit : bits) m_out << bit;
  }
  void write(TalixRotation const& rotation) {
    double q[4];
    rotation.getQuaternion(q);
    m_out << q[0] << " " << q[1] << " " << q[2] << " " << q[3];
  }
  void write(Module* const& module) { m_out << name(module); }
  void write(Attribute::Modules const& modules) {
    for (Module const* module : modules) m_out << name(module) << " ";
  }
  void write(Matrix const& matrix) {
    for (uint64 row = 0; row < matrix.rows(); ++row)
      for (uint64 col = 0; col < matrix.cols(); ++col) m_out << matrix[row][col] << " ";
  }
  template <class Number>
  void write(Number number) {
    m_out << number;
  }

  void writeChannel(Controller const& channel) {
    m_out << " " << channel.getName().GetStr() << "#" << channel.getID().getNumber() << " "
          << static_cast<int>(channel.getInterpolation()) << (channel.isLocked() ? " locked" : "");
    for (double const value : channel.getDefaultValues()) m_out << " " << value;
    m_out << "\n";
    for (NLEClip* clip = m_scene.getHeadClip(); clip; clip = clip->getNext())
      for (int layer = 0; layer < clip->getNumLayers(); ++layer)
        if (KeyTrack const* track = channel.findTrack(clip, layer))
          writeKeys(*track, name(clip) + " " + std::to_string(layer));
  }
  void writeKeys(KeyTrack const& track, std::string const& where) {
    m_out << "  " << where << track.checkInvariants();
    track.forEach(0, track.count(), [&](KeyTrack::Key const& key) {
      m_out << " " << key.time << ":" << int{key.components} << int{key.selected} << int{key.bridges};
      for (int i = 0; i < track.width(); ++i) m_out << "," << key.values[static_cast<size_t>(i)];
    });
    m_out << "\n";
  }

  void writeNode(Node const& node) {
    m_out << " pre ";
    write(node.getPreTranslation());
    m_out << " ";
    write(node.getPreRotation());
    m_out << " world ";
    write(node.getWSPos(0));
    for (int i = 0; i < node.getNumConnectingLines(); ++i) {
      m_out << " line " << name(node.getConnectingLine(i).getTarget()) << " ";
      write(node.getConnectingLine(i).getConnectingColor());
    }
    m_out << "\n";
  }

  Database& m_scene;
  std::ostringstream m_out;
};

// Empty when the texts are the same, else the first line in which they differ.
inline std::string firstDifference(std::string const& expected, std::string const& found) {
  std::istringstream a(expected), b(found);
  for (std::string one, other;;) {
    bool const more = static_cast<bool>(std::getline(a, one)),
               others = static_cast<bool>(std::getline(b, other));
    if (!more && !others) return "";
    if (!more || !others || one != other)
      return "expected: " + (more ? one : "(the end)") + "\n  found:    " + (others ? other : "(the end)");
  }
}

}  // namespace talix_tests
