#include "host/scene/Editability.h"

#include "host/scene/Clips.h"
#include "host/scene/Database.h"

Obstacle obstacleToKeys(Controller const& channel, NLEClip const* clip, int layer) {
  if (!clip) return Obstacle::noClip;
  if (!clip->holdsKeys()) return Obstacle::blendClip;
  if (clip->isLocked()) return Obstacle::clipLocked;
  if (clip->isLayerLocked(layer)) return Obstacle::layerLocked;
  return obstacleToDefault(channel);
}

Obstacle obstacleToKeys(Controller const& channel) {
  Database const& scene = *channel.getDatabase();
  return obstacleToKeys(channel, scene.getActiveClip(), scene.getActiveLayer());
}

Obstacle obstacleToDefault(Controller const& channel) {
  Module const* module = channel.getModule();
  if (module && module->isLocked()) return Obstacle::moduleLocked;
  return channel.isLocked() ? Obstacle::channelLocked : Obstacle::none;
}

Obstacle obstacleToValue(Controller const& channel) {
  return channel.getDatabase()->getActiveClip() ? obstacleToKeys(channel) : obstacleToDefault(channel);
}

Obstacle obstacleToPreTransform(Node const& node) {
  return node.isLocked() ? Obstacle::moduleLocked : Obstacle::none;
}

char const* reasonOf(Obstacle obstacle) {
  switch (obstacle) {
    case Obstacle::none:
      break;
    case Obstacle::noClip:
      return "no clip is active";
    case Obstacle::blendClip:
      return "a blend clip holds no keys of its own";
    case Obstacle::clipLocked:
      return "the clip is locked";
    case Obstacle::layerLocked:
      return "the layer is locked";
    case Obstacle::moduleLocked:
      return "the module is locked";
    case Obstacle::channelLocked:
      return "the channel is locked";
  }
  return "";
}
