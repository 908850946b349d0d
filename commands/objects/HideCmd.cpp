#include "commands/PendingCommand.h"

namespace {

class HideCmd final : public PendingCommand<HideCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "hide",
      .displayName = "Hide",
      .category = "Data Editing",
      .subCategory = "Data Manipulators",
      .purpose = "Hides modules: the named ones, the selected ones, or all.",
      .args = {"[\"name1\" \"name2\" ...]", 0, ArgsInfo::kAny, {}, Variable::String},
      .options = {{"s", 0, Variable::None, 6, true},
                  {"u", 0, Variable::None, 5},
                  {"primary", 0, Variable::None, 3},
                  {"t"},
                  {"all", 0, Variable::None, 6, true}}};
};

}  // namespace

Command* newHideCmd() { return new (std::nothrow) HideCmd; }
