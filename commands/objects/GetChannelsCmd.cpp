#include "commands/PendingCommand.h"

namespace {

class GetChannelsCmd final : public PendingCommand<GetChannelsCmd> {
 public:
  static constexpr CommandInfo info = {.name = "getChannels",
                                       .displayName = "Get Selected Channels",
                                       .category = "Data Editing",
                                       .subCategory = "Data Retrieval",
                                       .purpose = "",
                                       .returns = Variable::StringArray};
};

}  // namespace

Command* newGetChannelsCmd() { return new (std::nothrow) GetChannelsCmd; }
