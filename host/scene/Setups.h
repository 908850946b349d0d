// Setups hold the parameters of labelling and solving: the module's numeric custom attributes.
#pragma once

#include "host/scene/Module.h"

// A named number of a setup.
class Parameter {
 public:
  explicit Parameter(Attribute* attribute) : m_attribute(attribute) {}
  HString const& getName() const { return m_attribute->getName(); }
  Attribute* getAttribute() const { return m_attribute; }
  double getValue() const;

 private:
  Attribute* m_attribute;
};

class ParameterizedSetup : public Module {
  H_DECLARE_CLASS(ParameterizedSetup, Module)

 public:
  // The custom integer, float and boolean attributes, in the order in which they were added. The setup owns
  // what it returns, until a parameter is next asked for.
  int getNumParameters() const;
  Parameter* getParameter(int i);
  Parameter* getParameter(HString name);

 private:
  std::vector<Attribute*> parameters() const;
  std::unique_ptr<Parameter> m_returned;
};

class LabelingSetup : public ParameterizedSetup {
  H_DECLARE_CLASS(LabelingSetup, ParameterizedSetup)
};

class SolvingSetup : public ParameterizedSetup {
  H_DECLARE_CLASS(SolvingSetup, ParameterizedSetup)
};
