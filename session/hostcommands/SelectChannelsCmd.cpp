#include "host/command/ChannelName.h"
#include "host/command/ScriptCommand.h"
#include "host/scene/Database.h"

namespace talix {

namespace {

class SelectChannelsCmd final : public ScriptCommand<SelectChannelsCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "selectChannels",
      .displayName = "Select Channels",
      .category = "Data Editing",
      .subCategory = "Data Manipulators",
      .purpose = "Sets the channels and components that key commands work on, in order.",
      .example = "selectChannels Translation rz",
      .args = {"[NAME[.x|.y|.z]...]", 0, ArgsInfo::kAny, {}, Variable::String},
      .argsText =
          "Channels, whole or by component (Translation, tx, Rotation.z), in the order to work on. They "
          "replace those that were active, on whatever modules are selected later.",
      .options = {{"none", "leaves no channel active"}}};

  bool checkArgSyntax(Args const& args, Given const& options) const override {
    return (args.getCount() > 0 || options.getCount() > 0) && fits(info.args, args);
  }

  bool execute(Given const&, Args const& args, Variable&) override {
    std::vector<unsigned> ids;
    for (Variable const& arg : args) {
      auto const channel = channelChoiceFrom(arg.getStringValue(-1));
      if (!channel) return false;
      ids.push_back(channel->property());
    }
    g_db->setActiveProperties(std::move(ids));
    return true;
  }
};

}  // namespace

Command* newSelectChannelsCmd() { return new SelectChannelsCmd; }

}  // namespace talix
