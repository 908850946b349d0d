// May this be written? One place that decides, and that gives the reason when not. Commands that write ask
// here first; what has no check of its own in the object model (Controller::setDefaultValues, setTrack,
// Node::setConst..., Node::setPre...) stores whatever it is given.
//
// Default values and pre-transforms are not animation: neither clips nor layers protect them.
#pragma once

class Controller;
class NLEClip;
class Node;

// In the order in which they are looked for: of several the first is named.
enum class Obstacle : unsigned char {
  none,
  noClip,
  blendClip,
  clipLocked,
  layerLocked,
  moduleLocked,
  channelLocked
};

// To the keys of a channel in a layer of a clip; no clip (null) stands for the base clip.
Obstacle obstacleToKeys(Controller const& channel, NLEClip const* clip, int layer);
// The same for the active layer of the active clip.
Obstacle obstacleToKeys(Controller const& channel);
Obstacle obstacleToDefault(Controller const& channel);
// To what the setters of a node write: a key where a clip is active, else the default value.
Obstacle obstacleToValue(Controller const& channel);
Obstacle obstacleToPreTransform(Node const& node);

// "the channel is locked"; for `none` an empty text.
char const* reasonOf(Obstacle obstacle);
