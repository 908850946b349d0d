#include "commands/PendingCommand.h"

namespace {

class TranscodeVideoCmd final : public PendingCommand<TranscodeVideoCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "transcodeVideo",
      .displayName = "Transcode Video",
      .category = "Data Editing",
      .purpose = "Converts a video file, with a timecode overlay and corrections where wanted.",
      .example = "transcodeVideo walk.avi walk.mp4 -quality 80",
      .args = {"\"sourceFile\" \"destinationFile\"", 2, 2, {Variable::String, Variable::String}},
      .argsText =
          "Paths of the file to read and the one to write. Not available yet: the line is checked, then it "
          "fails.",
      .options = {
          {"videoPayload", "format of the picture, by name", 1, Variable::String},
          {"audioPayload", "format of the sound, by name", 1, Variable::String, 0, true},
          {"quality", "quality of the picture, a whole number", 1, Variable::Int},
          {"timecodeOverlay", "writes the timecode into the picture"},
          {"timecodeOverlayPosition", "where the timecode stands, by name, in any case", 1, Variable::String},
          {"timecodeOverlaySize", "size of the timecode, by name, in any case", 1, Variable::String},
          {"overrideSaturation", "saturation to use instead of the file's own", 1, Variable::Float},
          {"overrideGammaCorrection", "gamma correction to use instead of the file's own", 1,
           Variable::Float},
          {"correctForLensDistortion", "takes the lens distortion out of the picture"},
          {"backupOriginalFile", "keeps a copy of the source file"},
          {"removeAudio", "leaves the sound out"},
          {"shiftPrincipalPointToCentre",
           "shifts the picture so that the lens's principal point is its centre"}}};
};

}  // namespace

Command* newTranscodeVideoCmd() { return new (std::nothrow) TranscodeVideoCmd; }
