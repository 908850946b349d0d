// A coloured line drawn from a node to another; its source holds it.
#pragma once

#include "host/math/Vec3.h"

class Node;

class MarkerConnection {
 public:
  MarkerConnection() : m_color(getDefaultColor()) {}
  explicit MarkerConnection(Node* target) : m_target(target), m_color(getDefaultColor()) {}

  Node* getTarget() const { return m_target; }
  // Red, green and blue, 0 to 255.
  Vec3 getConnectingColor() const { return m_color; }
  void setConnectingColor(Vec3 color) { m_color = color; }
  static Vec3 getDefaultColor();

 private:
  Node* m_target = nullptr;
  Vec3 m_color;
};
