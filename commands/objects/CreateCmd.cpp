#include "commands/PendingCommand.h"

namespace {

class CreateCmd final : public PendingCommand<CreateCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "create",
      .displayName = "Create Object",
      .category = "Data Editing",
      .purpose = "Creates modules of a type, one for each name.",
      .args = {"moduleType \"name1\" [\"name2\"] ...", 2, ArgsInfo::kAny, {}, Variable::String},
      .options = {{"addSelect"},
                  {"parent", 1, Variable::String},
                  {"positionOffset", 1, Variable::Vector},
                  {"rotationOffset", 1, Variable::Vector},
                  {"preTranslation", 1, Variable::Vector},
                  {"preRotation", 1, Variable::Vector},
                  {"allClips"},
                  {"multiple", 1, Variable::Int}},
      .solo = Solo::no};
};

}  // namespace

Command* newCreateCmd() { return new (std::nothrow) CreateCmd; }
