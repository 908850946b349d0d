#include "commands/PendingCommand.h"

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

  bool checkArgSyntax(Args const& args, Given const&) const override {
    for (Variable const& arg : args)
      if (arg.getType() != Variable::String && arg.getType() != Variable::StringArray) return false;
    return true;
  }
};

}  // namespace

Command* newShowCmd() { return new (std::nothrow) ShowCmd; }
