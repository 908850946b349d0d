#include "commands/transforms/TransformReading.h"

#include "host/command/Targets.h"
#include "host/scene/Database.h"
#include "host/scene/HTimeManager.h"

bool readQuery(Given const& given, Args const& args, QueryOptions const& which, QueryTexts const& texts,
               TransformQuery& query) {
  for (CommandOption const& option : given) {
    if (option.getIndex() != which.inSpaceOf) continue;
    HString const path = option.getArg(0).getStringValue(-1);
    // Any module of that path, so that one of another kind is refused rather than passed over.
    query.space = objectAs<Node>(g_db->getModuleWithPath(path, nullptr, false));
    if (!query.space) {
      Command::logError(texts.badSpace, path.GetStr());
      return false;
    }
  }
  query.node = moduleAt<Node>(args[0].getStringValue(-1), texts.badNode);
  if (!query.node) return false;

  GivenOptions const options(given);
  query.local = !options.has(which.world) && !query.space;
  if (options.has(which.world)) query.space = nullptr;
  if (options.has(which.byDefault)) query.value = TransformQuery::Default;
  if (options.has(which.preTransform)) query.value = TransformQuery::PreTransform;
  query.time = HTimeManager::getInstance()->getTime();
  return true;
}

TalixRotation rotationFor(TransformQuery const& query) {
  Node const& node = *query.node;
  switch (query.value) {
    case TransformQuery::PreTransform:
      return query.local ? node.getPreRotation() : node.getPreRotationInSpaceOfNode(query.space);
    case TransformQuery::Default:
      return query.local ? node.getConstLocalRot(true) : node.getConstRotInSpaceOfNode(query.space);
    case TransformQuery::Now:
      break;
  }
  return query.local ? node.getLocalRot(query.time) : node.getRotInSpaceOfNode(query.time, query.space);
}
