// What the readers of a node's transform share: the node, the space and the value that are asked for.
#pragma once

#include "host/command/ScriptCommand.h"
#include "host/scene/Node.h"

struct TransformQuery {
  enum Value { Now, Default, PreTransform };

  Node* node = nullptr;
  bool local = true;
  Node* space = nullptr;  // unless local; null: the world
  Value value = Now;
  int64 time = 0;  // the current one
};

// The indices of a reader's options.
struct QueryOptions {
  int world, inSpaceOf, byDefault;
  int preTransform = -1;  // -1: not offered
};

// The %s is the path.
struct QueryTexts {
  char const* badSpace;
  char const* badNode;
};

// Those of the readers of rotations.
inline constexpr QueryTexts kRotationTexts = {
    "%s is not a valid unique path to a Node in the scene.",
    "%s  is not a valid unique path to a Node in the scene."};  // kept: two spaces

// Every "-inSpaceOf" must name a node, and the last decides; "-ws" goes before it, and the pre-transform
// before the default value. False, with a message, when a node is not found.
[[nodiscard]] bool readQuery(Given const& given, Args const& args, QueryOptions const& which,
                             QueryTexts const& texts, TransformQuery& query);

TalixRotation rotationFor(TransformQuery const& query);
