#include "commands/Arguments.h"
#include "commands/PendingCommand.h"

namespace {

class SetBoneLengthCmd final : public PendingCommand<SetBoneLengthCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "setBoneLength",
      .displayName = "Set Bone Length",
      .category = "Data Editing",
      .subCategory = "Data Manipulators",
      .purpose = "Gives the primary selected bone a length in millimetres by moving its children.",
      .args = {"length"},
      .options = {{"relative"}, {"adjustChildren"}}};

  // A whole number will do as well.
  bool checkArgSyntax(Args const& args, Given const&) const override {
    return args.getCount() == 1 && areNumbers(args);
  }
};

}  // namespace

Command* newSetBoneLengthCmd() { return new (std::nothrow) SetBoneLengthCmd; }
