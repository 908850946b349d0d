#include "commands/markers/UnlabeledMarkers.h"
#include "host/command/Targets.h"
#include "host/scene/motion/MarkerPacker.h"

namespace {

class UnpackCmd final : public ScriptCommand<UnpackCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "unpack",
      .displayName = "Unpack Marker Data",
      .category = "Data Editing",
      .purpose = "Splits markers at their gaps into one marker for each piece.",
      .example = "unpack",
      .argsText =
          "Of the selected unlabeled markers; with no marker selected of every marker, labelled ones too. "
          "Gaps are those of the active clip. The first piece stays; each further one gets a new marker."};

  bool execute(Given const&, Args const&, Variable&) override {
    MarkerPacker packer;
    packer.setMarkerList(g_db->getNumSelectedMarkers() == 0 ? g_db->getMarkers()
                                                            : selectedUnlabeledMarkers());
    if (int const split = packer.unpack(); split > 0)
      logInfo("Unpacked %d Markers", split);
    else
      logWarning("No markerd needed unpacking.");  // kept
    return true;
  }
};

}  // namespace

Command* newUnpackCmd() { return new (std::nothrow) UnpackCmd; }
