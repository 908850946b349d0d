// What the commands for connecting lines share.
#pragma once

#include "host/command/Results.h"
#include "host/command/ScriptCommand.h"
#include "host/scene/Marker.h"

// A colour as its whole red, green and blue.
inline bool answerColor(Variable& result, Vec3 const& color) {
  Variable parts(Variable::IntArray, 3);
  for (int i = 0; i < 3; ++i) parts.setValue(static_cast<int>(color[i]), i);
  return answer(result, parts);
}

// Removes the lines between two nodes, in either direction.
inline void disconnect(Node& a, Node& b) {
  a.removeConnectingLine(&b);
  b.removeConnectingLine(&a);
}

// The two markers that a command's arguments name. A path that names none is a warning, `badPath` with the
// path, and false.
[[nodiscard]] bool readMarkers(Args const& args, char const* badPath, Marker*& source, Marker*& target);

inline constexpr char const kNoMarkerAt[] = "%s  is not a valid path to a Marker in the scene.";  // kept
