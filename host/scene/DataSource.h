// Something that holds data over time and may be locked.
#pragma once

#include "host/base/HObject.h"

class DataSource : public HObject {
  H_DECLARE_CLASS(DataSource, HObject)

 public:
  enum PropertyType {
    NoProperty = 0,
    Vec3Property = 1,
    RotProperty = 2,
    FloatProperty = 3,
    IntProperty = 4,
    BoolProperty = 5
  };

  // Whether an edit now would be taken: see Controller.
  virtual bool isEditable() const = 0;
};
