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
      .example = "transcodeVideo walk.mp4 walk.mov -quality 80",
      .args = {"\"sourceFile\" \"destinationFile\"", 2, 2, {Variable::String, Variable::String}},
      .argsText =
          "Paths of the file to read and the one to write, whose suffix names the container; they may be the "
          "same. Keeps pictures, times, timecode and sound; docs/video.md tells more.",
      .options = {
          {"videoPayload", "encoder, or ENCODER:PRESET (libx264:slow); default H.264, else MPEG-4", 1,
           Variable::String},
          {"audioPayload", "deprecated and without effect: sound is kept", 1, Variable::String, 0, true},
          {"quality", "1 to 100; default 85", 1, Variable::Int},
          {"timecodeOverlay", "writes the timecode into the pictures"},
          {"timecodeOverlayPosition",
           "TopLeft (default), TopCenter, TopRight, BottomLeft, BottomCenter or BottomRight", 1,
           Variable::String},
          {"timecodeOverlaySize", "x-small, small, medium (default), large or x-large", 1, Variable::String},
          {"overrideSaturation", "factor of the saturation, 0 (grey) to 10; default 1", 1, Variable::Float},
          {"overrideGammaCorrection", "gamma correction, 0.1 to 10, more is brighter; default 1", 1,
           Variable::Float},
          {"correctForLensDistortion", "takes out the distortion of the primary selected camera's lens"},
          {"backupOriginalFile", "copies the source to NAME_Original.SUFFIX first, and reads that"},
          {"removeAudio", "leaves the sound out"},
          {"shiftPrincipalPointToCentre",
           "moves the principal point of the primary selected camera to the picture's centre"}}};
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
    Nex::IBurnInTimecodeSettings overlay;
    std::optional<float> saturation, gamma;
    // In the order given; position and size are checked whether there is an overlay or not.
    for (CommandOption const& option : given) {
      int const index = option.getIndex();
      Variable const value = option.getArgCount() > 0 ? option.getArg(0) : Variable();
      if (index == kAudioPayload) {
        logWarning(
            "-audioPayload has been deprecated. Audio payload will now be preserved by default. Use "
            "-removeAudio to remove audio.");
      } else if (index == kPosition && !read(value, kPositions, overlay.position)) {
        logError(
            "Invalid overlay position specified. Valid values are: TopLeft, TopCenter, TopRight, BottomLeft, "
            "BottomCenter, and BottomRight.");
        return false;
      } else if (index == kSize && !read(value, kSizes, overlay.size)) {
        logError("Invalid text size specified. Valid values are: x-small, small, medium, large and x-large.");
        return false;
      } else if (index == kSaturation) {
        saturation = static_cast<float>(value.getFloatValue(-1));
      } else if (index == kGamma) {
        gamma = static_cast<float>(value.getFloatValue(-1));
      }
    }
    GivenOptions const options(given);
    CommandOption const* quality = options.find(kQuality);
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

  // The place of a name among others, in any case. False when it is none of them.
  template <size_t kCount>
  static bool read(Variable const& name, char const* const (&names)[kCount], int& code) {
    HString value = name.getStringValue(-1);
    value.MakeLower();
    auto const* const found =
        std::find_if(names, names + kCount, [&](char const* each) { return value == each; });
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
};

}  // namespace

Command* newTranscodeVideoCmd() { return new (std::nothrow) TranscodeVideoCmd; }
