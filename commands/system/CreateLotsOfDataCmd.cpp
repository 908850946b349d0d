#include "commands/PendingCommand.h"

namespace {

class CreateLotsOfDataCmd final : public PendingCommand<CreateLotsOfDataCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "createLotsOfData",
      .displayName = "Create lots of data for test purposes",
      .category = "Testing",
      .purpose = "Fills the scene with markers that move, to test with.",
      .args = {"'numMarkers, NumFrames'", 2, 2, {Variable::Int, Variable::Int}},
      .solo = Solo::no};
};

}  // namespace

Command* newCreateLotsOfDataCmd() { return new (std::nothrow) CreateLotsOfDataCmd; }
