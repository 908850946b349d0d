// Moving nodes for benchmarks.
#pragma once

#include <string>
#include <vector>

#include "host/scene/Bones.h"
#include "host/scene/Database.h"

inline constexpr int64 kFrame = kTicksPerSecond / 120;

template <class T>
T* create(std::string const& name, Module* parent = nullptr) {
  return static_cast<T*>(g_db->createModule(&T::staticClass(), name.c_str(), parent));
}

// Keyed at every frame, as a take is.
inline void animate(Node* node, int frames) {
  std::vector<double> positions, rotations;
  for (int i = 0; i < frames; ++i) {
    double const part = i * 0.01;
    for (double const v : {part, 2 * part, 100.0}) positions.push_back(v);
    double xyzw[4];
    TalixRotation(Vec3(part, 0.2, 0.1)).getQuaternion(xyzw);
    rotations.insert(rotations.end(), xyzw, xyzw + 4);
  }
  KeyTrack moving(KeyTrack::Shape::Vector), turning(KeyTrack::Shape::Rotation);
  moving.append(0, kFrame, positions.data(), frames);
  turning.append(0, kFrame, rotations.data(), frames);
  node->getTranslationChannel()->setTrack(g_db->getActiveClip(), 0, std::move(moving));
  node->getRotationChannel()->setTrack(g_db->getActiveClip(), 0, std::move(turning));
}

// A new scene with one clip and a chain of bones in it; the last one. They are called bone0, bone1 ...
inline Node* chain(int bones, int frames) {
  g_db->newScene();
  create<Clip>("take");
  Node* last = nullptr;
  for (int i = 0; i < bones; ++i)
    animate(last = create<SolvingBone>("bone" + std::to_string(i), last), frames);
  return last;
}
