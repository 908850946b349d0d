#include <algorithm>
#include <iterator>
#include <optional>

#include "commands/video/BackupFile.h"
#include "host/base/EngineLibrary.h"
#include "host/command/ScriptCommand.h"
#include "host/services/VideoTranscoder.h"

namespace {

class TranscodeVideoCmd final : public ScriptCommand<TranscodeVideoCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "transcodeVideo",
      .displayName = "Transcode Video",
      .category = "Data Editing",
      .purpose = "Converts a video file, with a timecode overlay and corrections where wanted.",
      .args = {"\"sourceFile\" \"destinationFile\"", 2, 2, {Variable::String, Variable::String}},
      .options = {{"videoPayload", 1, Variable::String},
                  {"audioPayload", 1, Variable::String, 0, true},
                  {"quality", 1, Variable::Int},
                  {"timecodeOverlay"},
                  {"timecodeOverlayPosition", 1, Variable::String},
                  {"timecodeOverlaySize", 1, Variable::String},
                  {"overrideSaturation", 1, Variable::Float},
                  {"overrideGammaCorrection", 1, Variable::Float},
                  {"correctForLensDistortion"},
                  {"backupOriginalFile"},
                  {"removeAudio"},
                  {"shiftPrincipalPointToCentre"}}};
  static constexpr int kVideoPayload = info.option("videoPayload"),
                       kAudioPayload = info.option("audioPayload"), kQuality = info.option("quality"),
                       kOverlay = info.option("timecodeOverlay"),
                       kPosition = info.option("timecodeOverlayPosition"),
                       kSize = info.option("timecodeOverlaySize"),
                       kSaturation = info.option("overrideSaturation"),
                       kGamma = info.option("overrideGammaCorrection"),
                       kUndistort = info.option("correctForLensDistortion"),
                       kBackup = info.option("backupOriginalFile"), kRemoveAudio = info.option("removeAudio"),
                       kCentre = info.option("shiftPrincipalPointToCentre");

  bool execute(Given const& given, Args const& args, Variable&) override {
    GivenOptions const options(given);
    if (options.has(kAudioPayload)) {
      logWarning(
          "-audioPayload has been deprecated. Audio payload will now be preserved by default. Use "
          "-removeAudio to remove audio.");
    }
    // Checked whether there is an overlay or not.
    Nex::IBurnInTimecodeSettings overlay;
    if (!read(options, kPosition, kPositions, overlay.position)) {
      logError(
          "Invalid overlay position specified. Valid values are: TopLeft, TopCenter, TopRight, BottomLeft, "
          "BottomCenter, and BottomRight.");
      return false;
    }
    if (!read(options, kSize, kSizes, overlay.size)) {
      logError("Invalid text size specified. Valid values are: x-small, small, medium, large and x-large.");
      return false;
    }
    CommandOption const* quality = options.find(kQuality);
    std::optional<float> const saturation = number(options, kSaturation), gamma = number(options, kGamma);
    HString source = args[0].getStringValue(-1);
    if (options.has(kBackup) && !backUp(source)) return false;
    return VideoTranscoder().process(source, args[1].getStringValue(-1), options.textOr(kVideoPayload, ""),
                                     quality ? quality->getArg(0).getIntValue(-1) : 85,
                                     options.has(kRemoveAudio),
                                     options.has(kOverlay) ? std::optional(overlay) : std::nullopt,
                                     saturation, gamma, options.has(kUndistort), options.has(kCentre));
  }

 private:
  static constexpr char const* kPositions[] = {"topleft",    "topcenter",    "topright",
                                               "bottomleft", "bottomcenter", "bottomright"};
  static constexpr char const* kSizes[] = {"x-small", "small", "medium", "large", "x-large"};

  // The place of an option's value among the names, in any case; without the option `code` stays. False when
  // it is none of them.
  template <size_t kCount>
  static bool read(GivenOptions const& options, int option, char const* const (&names)[kCount], int& code) {
    if (!options.has(option)) return true;
    HString value = options.textOr(option, "");
    value.MakeLower();
    auto const* const found =
        std::find_if(names, names + kCount, [&](char const* name) { return value == name; });
    code = static_cast<int>(found - names);
    return found != names + kCount;
  }
  // The copy takes the source's place.
  static bool backUp(HString& source) {
    std::string copy, problem;
    auto* const backUpFile =
        reinterpret_cast<BackUpFile*>(findInEngineLibrary("libTalixBackup.so", kBackUpFile, problem));
    if (!backUpFile) {
      logError("No backup can be made: %s", problem.c_str());
      return false;
    }
    backUpFile(source, copy);
    source = copy;
    return true;
  }
  static std::optional<float> number(GivenOptions const& options, int option) {
    CommandOption const* given = options.find(option);
    if (!given) return std::nullopt;
    return static_cast<float>(given->getArg(0).getFloatValue(-1));
  }
};

}  // namespace

Command* newTranscodeVideoCmd() { return new (std::nothrow) TranscodeVideoCmd; }
