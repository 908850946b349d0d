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
      .args = {"\"moduleName\"", 1, 1, {Variable::String}},
      .options = {{"ws", 0, Variable::None, 2},
                  {"inSpaceOf", 1, Variable::String, 1},
                  {"preTrans", 0, Variable::None, 8},
                  {"default", 0, Variable::None, 4}},
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
