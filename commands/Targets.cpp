#include "commands/Targets.h"

#include "host/command/Command.h"
#include "host/scene/Database.h"

Module* moduleAt(HString const& path, char const* badPath) {
  Module* module = g_db->getModuleWithPath(path, nullptr, false);
  if (!module) Command::logError(badPath, path.GetStr());
  return module;
}

Node* nodeAt(HString const& path, char const* badPath) {
  Node* node = objectAs<Node>(g_db->getModuleWithPath(path, &Node::s_classNode, false));
  if (!node) Command::logError(badPath, path.GetStr());
  return node;
}
