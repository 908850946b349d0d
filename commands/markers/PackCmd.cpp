#include "commands/markers/UnlabeledMarkers.h"
#include "host/command/Targets.h"
#include "host/scene/motion/MarkerPacker.h"

namespace {

class PackCmd final : public ScriptCommand<PackCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "pack",
      .displayName = "Pack Marker Data",
      .category = "Data Editing",
      .purpose = "Joins pieces of unlabeled markers that can belong to one marker.",
      .example = "pack -minGap 3 -minDistance 20.0",
      .argsText =
          "Joins the selected unlabeled markers in as few as possible, in all clips. The first in time "
          "stays; the others leave the scene. Locked markers and those with something below them stay, with "
          "a warning.",
      .options = {
          {"minGap",
           "frames that must lack data between pieces, default 1; with 0 unpack could not part them again", 1,
           Variable::Int},
          {"minDistance",
           "mm that ends of pieces must be apart, default 0: nearer ones may be one marker, for you to "
           "decide",
           1, Variable::Float},
          {"marker", "path of the unlabeled marker to join into, instead of as many as are needed", 1,
           Variable::String}}};

  static constexpr int kMinGap = info.option("minGap"), kMinDistance = info.option("minDistance"),
                       kMarker = info.option("marker");

  bool execute(Given const& given, Args const&, Variable&) override {
    MarkerPacker packer;
    Marker* target = nullptr;
    for (CommandOption const& option : given) {
      Variable const value = option.getArg(0);
      if (option.getIndex() == kMinGap) packer.setMinimumGapSize(value.getIntValue(-1));
      if (option.getIndex() == kMinDistance) packer.setMimimumDistance(value.getFloatValue(-1));
      if (option.getIndex() != kMarker) continue;
      target = moduleAt<Marker>(value.getStringValue(-1),
                                "%s  is not a valid path to a Marker in the scene.");  // kept
      if (!target) return false;
      if (!target->isUnlabeled()) {
        logError("Only unlabeled Markers can be packed.");
        return false;
      }
    }
    packer.setMarkerList(selectedUnlabeledMarkers());
    if (int const packed = packer.pack(target); packed > 0)
      logInfo("Packed %d Trajectories", packed);
    else
      logWarning("Could not pack any Trajectories");
    return true;
  }
};

}  // namespace

Command* newPackCmd() { return new (std::nothrow) PackCmd; }
