#include <cmath>

#include "host/command/Arguments.h"
#include "host/scene/HTimeManager.h"
#include "host/scene/motion/DataResampler.h"

namespace {

class ResampleCmd final : public ScriptCommand<ResampleCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "resample",
      .displayName = "Resample Data",
      .category = "System",
      .purpose = "Changes the frame rate of the scene and computes its keys anew at the new frames.",
      .example = "resample custom 60",
      .args = {"\"rateType\" fps"},
      .argsText =
          "rateType is ntsc, ntscDrop, pal, film, filmNtsc or other (custom); fps is above 0 and at most "
          "2000. Every module in all clips, but for unlabeled markers; times stay, frames change, locked "
          "keys stay. Nothing is filtered: detail faster than half the new rate shows as slower motion.",
      .options = {{"selected", "only the selected modules; the others keep their keys", 0, Variable::None, 0,
                   true},
                  {"ignoreGaps", "fills gaps: curves go through; without it data stays missing where it was"},
                  {"includeUnlabeledMarkers", "unlabeled markers too; without it they keep their keys"}},
      .solo = Solo::no};

  bool checkArgSyntax(Args const& args, Given const&) const override {
    return args.getCount() == 2 && args[0].getType() == Variable::String && isIntOrFloat(args[1]);
  }

  static constexpr int kSelected = info.option("selected"), kIgnoreGaps = info.option("ignoreGaps"),
                       kIncludeUnlabeled = info.option("includeUnlabeledMarkers");

  bool execute(Given const& given, Args const& args, Variable&) override {
    HString name = args[0].getStringValue(-1), lower = name;
    lower.MakeLower();
    if (lower == "other" || lower == "custom") name = "Custom";
    if (!isIntOrFloat(args[1])) {
      logError("Frame rate should be specified as float or int.");
      return false;
    }
    double const rate = args[1].getFloatValue(-1);
    ETimecodeStandard standard;
    if (!HFrameRate::getTimecodeStandardFromString(name, standard)) {
      logError(
          "\"%s\" is not a valid timecode standard. Valid standards are \"ntsc\", \"ntscDrop\", \"pal\", "
          "\"film\", \"filmNtsc\", or \"other\"",
          name.GetStr());
      return false;
    }
    if (!(rate > 0 && rate <= HFrameRate::kMaximum)) {
      logError("%f is an unsupported rate", rate);
      return false;
    }
    HFrameRate const& current = HTimeManager::getInstance()->getFrameRate();
    if (standard == current.getTimecodeStandard() && std::abs(rate - current.getFrameRate()) < 0.01)
      return true;
    HFrameRate wanted;
    wanted.setTimecodeStandard(standard);
    wanted.setFrameRate(rate);
    GivenOptions const options(given);
    DataResampler::resample(wanted, options.has(kSelected), !options.has(kIgnoreGaps),
                            options.has(kIncludeUnlabeled));
    return true;
  }
};

}  // namespace

Command* newResampleCmd() { return new (std::nothrow) ResampleCmd; }
