#include "commands/PendingCommand.h"

namespace {

class CreateBoneVirtsCmd final : public PendingCommand<CreateBoneVirtsCmd> {
 public:
  static constexpr CommandInfo info = {.name = "createBoneVirts",
                                       .displayName = "Create Bone Virtual Markers",
                                       .category = "Data Editing",
                                       .purpose = "Creates virtual markers for the selected bones.",
                                       .options = {{"joint"}},
                                       .returns = Variable::StringArray};
};

}  // namespace

Command* newCreateBoneVirtsCmd() { return new (std::nothrow) CreateBoneVirtsCmd; }
