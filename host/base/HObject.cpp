#include "host/base/HObject.h"

constinit HRuntimeClass HObject::s_classHObject("HObject", std::array<HRuntimeClass const*, 0>{}, nullptr,
                                                HRuntimeClass::any);

void HObject::deleteThis() { delete this; }

HObject::~HObject() = default;

HRuntimeClass* HObject::getRuntimeClass() const { return &s_classHObject; }
