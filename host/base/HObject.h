// Root of every host class that has a run-time class record.
#pragma once

#include "host/base/HRuntimeClass.h"

class HObject {
 public:
  static constexpr size_t kClassDepth = 0;
  static HRuntimeClass s_classHObject;
  static constexpr HRuntimeClass& staticClass() { return s_classHObject; }

  HObject() = default;
  HObject(HObject const&) = delete;
  HObject& operator=(HObject const&) = delete;

  // How others end an object. Destroys it, unless a class counts references or is owned elsewhere.
  virtual void deleteThis();
  virtual ~HObject();
  virtual HRuntimeClass* getRuntimeClass() const;

  bool isKindOf(HRuntimeClass const* record) const { return getRuntimeClass()->isDerivedFrom(record); }
};

// The object as a T when it is one, else null.
template <class T>
T* objectAs(HObject* object) {
  return object && object->isKindOf(&T::staticClass()) ? static_cast<T*>(object) : nullptr;
}
template <class T>
T const* objectAs(HObject const* object) {
  return object && object->isKindOf(&T::staticClass()) ? static_cast<T const*>(object) : nullptr;
}
