#include "commands/transforms/TransformWriting.h"

#include <cmath>

#include "host/command/Targets.h"
#include "host/scene/DataEdit.h"
#include "host/scene/HTimeManager.h"

bool readWrite(Given const& given, Args const& args, WriteOptions const& which, char const* command,
               TransformWrite& write) {
  write.time = HTimeManager::getInstance()->getTime();
  GivenOptions const options(given);
  write.world = options.has(which.world);
  write.byDefault = options.has(which.byDefault);
  write.preTransform = options.has(which.preTransform);
  write.node = moduleAt<Node>(args[0].getStringValue(-1), "%s is not a valid path to a node in the scene.");
  write.vector = args[1].getVecValue(-1);
  return write.node && areFinite(write.vector, command);
}

bool areFinite(Vec3 const& values, char const* command) {
  // The length as well: a rotation vector is taken by it.
  if (isFinite(values) && std::isfinite(values.length())) return true;
  Command::logError("%s needs finite numbers.", command);
  return false;
}

bool isFree(Obstacle obstacle, char const* what, Module const& module) {
  if (obstacle == Obstacle::none) return true;
  Command::logWarning("%s is not editable on %s: %s.", what, module.getName().GetStr(), reasonOf(obstacle));
  return false;
}

bool isWritable(Controller const& channel, bool byDefault) {
  return isFree(byDefault ? obstacleToDefault(channel) : obstacleToValue(channel), channel.getName().GetStr(),
                *channel.getModule());
}

bool writeRotation(TransformWrite const& write, TalixRotation const& rotation) {
  Node& node = *write.node;
  // Kept: the pre-rotation is written besides, not instead.
  if (write.preTransform && isFree(obstacleToPreTransform(node), "Pre-rotation", node))
    write.world ? node.setPreRotationWS(rotation) : static_cast<void>(node.setPreRotation(rotation, false));
  if (!isWritable(*node.getRotationChannel(), write.byDefault)) return true;
  if (write.byDefault) {
    write.world ? node.setConstWSRot(rotation) : node.setConstLocalRot(rotation, true);
    return true;
  }
  DataEdit const edit(node, write.edited());
  write.world ? node.setWSRot(write.time, rotation) : node.setLocalRot(write.time, rotation);
  return true;
}
