#include "commands/PendingCommand.h"

namespace {

class GetColorCmd final : public PendingCommand<GetColorCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getColor",
      .displayName = "Get Colors",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose = "A display colour of the scene as red, green and blue, 0 to 255.",
      .args = {"selected | primarySelected | default | markerLines", 1, 1, {Variable::String}},
      .returns = Variable::IntArray,
      .solo = Solo::no};
};

}  // namespace

Command* newGetColorCmd() { return new (std::nothrow) GetColorCmd; }
