#include "commands/transforms/TransformReading.h"
#include "host/command/Results.h"

namespace {

class GetPositionCmd final : public ScriptCommand<GetPositionCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getPosition",
      .displayName = "Get Node Position",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose = "The position of a node in millimetres: local, in the world, or as seen from another node.",
      .example = "getPosition LFHD -ws",
      .args = {"\"moduleName\"", 1, 1, {Variable::String}},
      .argsText =
          "moduleName is the path of a node. Without an option the channel's own value at the current time.",
      .options = {{"ws", "in the world; goes before -inSpaceOf", 0, Variable::None, 2},
                  {"inSpaceOf", "path of the node in whose space to tell it", 1, Variable::String, 1},
                  {"preTrans", "the pre-translation: the fixed offset that comes before the channels", 0,
                   Variable::None, 8},
                  {"default", "the default value of the channel instead of that at the current time", 0,
                   Variable::None, 4}},
      .returns = Variable::Vector,
      .solo = Solo::no};
  static constexpr QueryOptions kOptions = {info.option("ws"), info.option("inSpaceOf"),
                                            info.option("default"), info.option("preTrans")};

  bool execute(Given const& given, Args const& args, Variable& result) override;
};

Vec3 positionFor(TransformQuery const& query) {
  Node const& node = *query.node;
  switch (query.value) {
    case TransformQuery::PreTransform:
      return query.local ? node.getPreTranslation() : node.getPreTranslationInSpaceOfNode(query.space);
    case TransformQuery::Default:
      return query.local ? node.getConstLocalPos() : node.getConstPosInSpaceOfNode(query.space);
    case TransformQuery::Now:
      break;
  }
  return query.local ? node.getLocalPos(query.time) : node.getPosInSpaceOfNode(query.time, query.space);
}

bool GetPositionCmd::execute(Given const& given, Args const& args, Variable& result) {
  constexpr QueryTexts texts = {"%s is not a valid unique path to a Node in the scene.",
                                "%s is not a valid unique path to a Node in the scene."};
  TransformQuery query;
  return readQuery(given, args, kOptions, texts, query) && answer(result, positionFor(query));
}

}  // namespace

Command* newGetPositionCmd() { return new (std::nothrow) GetPositionCmd; }
