#include "commands/markers/MarkerConnections.h"
#include "host/command/Results.h"
#include "host/scene/Database.h"

namespace {

class GetColorCmd final : public ScriptCommand<GetColorCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getColor",
      .displayName = "Get Colors",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose = "A display colour of the scene as red, green and blue, 0 to 255.",
      .example = "getColor markerLines",
      .args = {"selected | primarySelected | default | markerLines", 1, 1, {Variable::String}},
      .argsText =
          "Which one: of the selected modules, the primary one, all others, or new lines between markers.",
      .returns = Variable::IntArray,
      .solo = Solo::no};

  bool execute(Given const&, Args const& args, Variable& result) override {
    HString const item = args[0].getStringValue(-1);
    if (item == "primarySelected") return answerColor(result, Database::getPrimSelModColor());
    if (item == "selected") return answerColor(result, Database::getSelModColor());
    if (item == "default") return answerColor(result, Database::getDefaultModColor());
    if (item == "markerLines") return answerColor(result, MarkerConnection::getDefaultColor());
    logError("\"%s\" invalid item type", item.GetStr());
    return false;
  }
};

}  // namespace

Command* newGetColorCmd() { return new (std::nothrow) GetColorCmd; }
