// What the writers of a node's transform share: the node, the vector, and where and how it is written.
#pragma once

#include "host/command/ScriptCommand.h"
#include "host/scene/Editability.h"
#include "host/scene/Node.h"

struct TransformWrite {
  Node* node = nullptr;
  Vec3 vector;  // as given; finite
  bool world = false;
  bool byDefault = false;
  bool preTransform = false;
  int64 time = 0;  // the current one

  // The range that an edit at the current time is announced for.
  HTimeRange edited() const { return {time - 1, time + 1}; }
};

// The indices of a writer's options.
struct WriteOptions {
  int world, byDefault;
  int preTransform = -1;  // -1: not offered
};

// False, with a message, when the node is not found or the vector is not finite.
[[nodiscard]] bool readWrite(Given const& given, Args const& args, WriteOptions const& which,
                             char const* command, TransformWrite& write);

// Whether numbers are finite; else logs that the command needs such.
[[nodiscard]] bool areFinite(Vec3 const& values, char const* command);

// Whether nothing stands in the way of writing; else warns of it: what is not editable on which module.
[[nodiscard]] bool isFree(Obstacle obstacle, char const* what, Module const& module);

// Whether the value of a channel can be written; else warns.
[[nodiscard]] bool isWritable(Controller const& channel, bool byDefault);

// Sets the rotation of the node as asked for. Always returns true.
bool writeRotation(TransformWrite const& write, TalixRotation const& rotation);
