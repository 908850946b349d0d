// Converts a video file.
#pragma once

#include <optional>

#include "host/base/HString.h"
#include "host/services/VideoJob.h"

class VideoTranscoder {
 public:
  VideoTranscoder();
  virtual ~VideoTranscoder();

  // Writes the source into the destination, which stays as it was unless all went well and may be the source
  // itself. Payload: ENCODER or ENCODER:PRESET, empty for the usual one of the container, which the
  // destination's suffix tells. Quality: 1 to 100. The lens is that of the primary selected OpticalCamera of
  // the current scene. Shows its progress. False, with an error line, when it failed; without one when the
  // user cancelled.
  virtual bool process(HString source, HString destination, HString videoPayload, int quality,
                       bool removeAudio, std::optional<Nex::IBurnInTimecodeSettings> burnIn,
                       std::optional<float> saturation, std::optional<float> gamma,
                       bool correctForLensDistortion, bool shiftPrincipalPointToCentre);
};
