#include "host/scene/Selection.h"

void Selection::add(Module* module) {
  if (module->isSelected()) return;
  m_modules.append(module);
  if (auto* node = objectAs<Node>(module)) m_nodes.append(node);
  if (auto* marker = objectAs<Marker>(module)) m_markers.append(marker);
  if (auto* character = objectAs<Character>(module)) m_characters.append(character);
  if (auto* bone = objectAs<LabelingBone>(module)) m_bones.append(bone);
  m_primary = module;
}

void Selection::remove(Module* module) {
  if (!module->isSelected()) return;
  m_modules.remove(module);
  if (auto* node = objectAs<Node>(module)) m_nodes.remove(node);
  if (auto* marker = objectAs<Marker>(module)) m_markers.remove(marker);
  if (auto* character = objectAs<Character>(module)) m_characters.remove(character);
  if (auto* bone = objectAs<LabelingBone>(module)) m_bones.remove(bone);
  if (m_primary == module) m_primary = getCount() ? at(getCount() - 1) : nullptr;
}

void Selection::clear() {
  m_modules.clear();
  m_nodes.clear();
  m_markers.clear();
  m_characters.clear();
  m_bones.clear();
  m_primary = nullptr;
}

void Selection::setPrimary(Module* module) {
  if (module) add(module);
  m_primary = module;
}
