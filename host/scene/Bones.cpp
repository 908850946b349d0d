#include "host/scene/Bones.h"

H_DEFINE_ABSTRACT_CLASS(BaseBone);
H_DEFINE_CLASS(LabelingBone);
H_DEFINE_CLASS(SolvingBone);

namespace {

Attribute::Labels labels(std::vector<HString> texts) {
  return std::make_shared<std::vector<HString> const>(std::move(texts));
}

}  // namespace

void BaseBone::setUp() {
  static Attribute::Labels const axes = labels({"X", "Y", "Z"});
  static Attribute::Labels const dofs = labels({"Tx", "Ty", "Tz", "Rx", "Ry", "Rz"});
  Node::setUp();
  addChannel("Length", DataSource::FloatProperty);
  m_majorAxis = addBuiltIn<EnumAttribute>("MajorAxis", axes);
  m_minorAxis = addBuiltIn<EnumAttribute>("MinorAxis", axes);
  m_minorAxis->setIndex(1, false, false, false, false);
  m_dofs = addBuiltIn<BitFieldAttribute>("DOFs", dofs);
  for (char const* rotation : {"Rx", "Ry", "Rz"})
    m_dofs->setValue(rotation, true, false, false, false, false);
}

int BaseBone::getNumDofs() const {
  int count = 0;
  for (int i = 0; i < m_dofs->getNumFields(); ++i) count += m_dofs->getField(i);
  return count;
}
