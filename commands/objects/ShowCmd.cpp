#include "commands/PendingCommand.h"
#include "host/command/Arguments.h"

namespace {

class ShowCmd final : public PendingCommand<ShowCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "show",
      .displayName = "Show",
      .category = "Data Editing",
      .subCategory = "Data Manipulators",
      .purpose = "Shows hidden modules: the named ones, or the selected ones.",
      .args = {"name1 name2 ..."},
      .options = {{"s"}}};

  bool checkArgSyntax(Args const& args, Given const&) const override { return areTexts(args); }
};

}  // namespace

Command* newShowCmd() { return new (std::nothrow) ShowCmd; }
