#include "commands/PendingCommand.h"

namespace {

class CopyDataCmd final : public PendingCommand<CopyDataCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "copyData",
      .displayName = "Copy Data",
      .category = "Data Editing",
      .purpose = "Copies the data of one channel to channels of other modules.",
      .args = {"module1.outputName module2.inputName1 ...", 2, ArgsInfo::kAny, {}, Variable::String},
      .solo = Solo::no};
};

}  // namespace

Command* newCopyDataCmd() { return new (std::nothrow) CopyDataCmd; }
