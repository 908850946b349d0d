#include "host/scene/Setups.h"

H_DEFINE_ABSTRACT_CLASS(ParameterizedSetup);
H_DEFINE_CLASS(LabelingSetup);
H_DEFINE_CLASS(SolvingSetup);

double Parameter::getValue() const {
  double value = 0;
  m_attribute->getModule()->getPropertyVal(getName(), value, true);
  return value;
}

std::vector<Attribute*> ParameterizedSetup::parameters() const {
  std::vector<Attribute*> found;
  for (int i = 0; i < getNumAttributes(); ++i) {
    Attribute* attribute = getAttribute(i);
    Attribute::Type const type = attribute->getType();
    bool const number = type == Attribute::Integer || type == Attribute::Float || type == Attribute::Boolean;
    if (number && attribute->isCustom()) found.push_back(attribute);
  }
  return found;
}

int ParameterizedSetup::getNumParameters() const { return static_cast<int>(parameters().size()); }

Parameter* ParameterizedSetup::getParameter(int i) {
  Attribute* attribute = itemAt(parameters(), i);
  m_returned = attribute ? std::make_unique<Parameter>(attribute) : nullptr;
  return m_returned.get();
}

Parameter* ParameterizedSetup::getParameter(HString name) {
  for (Attribute* attribute : parameters()) {
    if (attribute->getName() != name) continue;
    m_returned = std::make_unique<Parameter>(attribute);
    return m_returned.get();
  }
  return nullptr;
}
