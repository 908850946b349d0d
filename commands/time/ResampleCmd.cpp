#include "commands/PendingCommand.h"
#include "host/command/Arguments.h"

namespace {

class ResampleCmd final : public PendingCommand<ResampleCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "resample",
      .displayName = "Resample Data",
      .category = "System",
      .purpose = "Changes the frame rate of the scene and computes its keys anew at the new frames.",
      .args = {"\"rateType\" fps"},
      .options = {{"selected", 0, Variable::None, 0, true}, {"ignoreGaps"}, {"includeUnlabeledMarkers"}},
      .solo = Solo::no};

  bool checkArgSyntax(Args const& args, Given const&) const override {
    return args.getCount() == 2 && args[0].getType() == Variable::String && isIntOrFloat(args[1]);
  }
};

}  // namespace

Command* newResampleCmd() { return new (std::nothrow) ResampleCmd; }
