#include "commands/PendingCommand.h"

namespace {

class TranscodeVideoCmd final : public PendingCommand<TranscodeVideoCmd> {
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
};

}  // namespace

Command* newTranscodeVideoCmd() { return new (std::nothrow) TranscodeVideoCmd; }
