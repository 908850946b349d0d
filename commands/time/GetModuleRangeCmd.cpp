#include "commands/PendingCommand.h"
#include "host/command/Arguments.h"

namespace {

class GetModuleRangeCmd final : public PendingCommand<GetModuleRangeCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getModuleRange",
      .displayName = "Get Module(s) Data Range",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose = "The first and last frame of the keys of one or several modules.",
      .args = {"module or moduleArray"},
      .options = {{"i"}},
      .returns = Variable::IntArray,
      .solo = Solo::no};

  bool checkArgSyntax(Args const& args, Given const&) const override {
    return args.getCount() == 1 && areTexts(args);
  }
};

}  // namespace

Command* newGetModuleRangeCmd() { return new (std::nothrow) GetModuleRangeCmd; }
