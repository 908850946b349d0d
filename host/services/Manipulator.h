// The interactive editing tool of the current scene.
#pragma once

class Manipulator {
 public:
  enum EToolType { Select = 0, Translate = 1, Rotate = 2, Scale = 3, Orbit = 4, Pan = 5 };

  static EToolType getCurrentToolType();
  static void setCurrentToolType(EToolType type);
};
