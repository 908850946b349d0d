// Stands here and not beside its header because cameras are modules.
#include "host/services/VideoTranscoder.h"

#include <sys/stat.h>
#include <system_error>

#include "host/base/EngineLibrary.h"
#include "host/base/Log.h"
#include "host/base/ReplaceFile.h"
#include "host/scene/Database.h"
#include "host/scene/Devices.h"
#include "host/services/OperationStack.h"

namespace {

bool fail(std::string const& problem) {
  writeLog(LogLevel::Error, problem);
  return false;
}

// An attribute that is missing, or of another kind, is no distortion.
double factorOf(Module const& camera, char const* name) {
  auto const* factor = objectAs<FloatAttribute>(camera.getAttribute(name));
  return factor ? factor->getValue() : 0;
}

bool readLens(VideoLens& lens) {
  auto const* camera = objectAs<OpticalCamera>(g_db->getPrimarySelectedModule());
  if (!camera) return fail("Select an OpticalCamera whose lens is to be used.");
  auto const* attribute = objectAs<MatrixAttribute>(camera->getAttribute("Intrinsics"));
  if (attribute && attribute->getValue().rows() == 3) {
    Matrix const& m = attribute->getValue();
    lens = {m[0][0], m[1][1], m[0][2], m[1][2]};
  }
  if (!(lens.fx > 0 && lens.fy > 0))
    return fail("The Intrinsics of " + camera->getName().GetString() + " have no focal length.");
  lens.k1 = factorOf(*camera, "K1");
  lens.k2 = factorOf(*camera, "K2");
  lens.k3 = factorOf(*camera, "K3");
  lens.p1 = factorOf(*camera, "P1");
  lens.p2 = factorOf(*camera, "P2");
  return true;
}

// Leaves the writing of a file that then is none.
struct Unfinished {};

}  // namespace

VideoTranscoder::VideoTranscoder() = default;
VideoTranscoder::~VideoTranscoder() = default;

bool VideoTranscoder::process(HString source, HString destination, HString videoPayload, int quality,
                              bool removeAudio, std::optional<Nex::IBurnInTimecodeSettings> burnIn,
                              std::optional<float> saturation, std::optional<float> gamma,
                              bool correctForLensDistortion, bool shiftPrincipalPointToCentre) {
  if (quality < 1 || quality > 100) return fail("The quality of a video is 1 to 100.");
  if (saturation && !(*saturation >= 0 && *saturation <= 10))
    return fail("The saturation of a video is 0 to 10.");
  if (gamma && !(*gamma >= 0.1f && *gamma <= 10))
    return fail("The gamma correction of a video is 0.1 to 10.");
  VideoLens lens;
  bool const usesLens = correctForLensDistortion || shiftPrincipalPointToCentre;
  if (usesLens && !readLens(lens)) return false;
  // Replacing anything else, such as a device, would destroy it.
  struct stat former {};
  if (::stat(destination, &former) == 0 && !S_ISREG(former.st_mode))
    return fail(destination.GetString() + ": not a file that can be replaced");
  std::string problem;
  auto* const transcode =
      reinterpret_cast<TranscodeVideo*>(findInEngineLibrary("libTalixVideo.so", kTranscodeVideo, problem));
  if (!transcode) return fail("Videos cannot be transcoded: " + problem);

  VideoJob job{.source = source,
               .destination = destination,
               .payload = videoPayload,
               .quality = quality,
               .removeAudio = removeAudio,
               .burnIn = burnIn ? &*burnIn : nullptr,
               .saturation = saturation ? &*saturation : nullptr,
               .gamma = gamma ? &*gamma : nullptr,
               .lens = usesLens ? &lens : nullptr,
               .undistort = correctForLensDistortion,
               .centre = shiftPrincipalPointToCentre,
               .goOn =
                   [](int done) {
                     g_theOperationStack.setTaskPos(done);
                     return !g_theOperationStack.isCancelled();
                   },
               .warn = [](char const* text) { writeLog(LogLevel::Warning, text); }};
  OperationTask const task("Transcoding " + source.GetString());
  VideoOutcome outcome = VideoOutcome::failed;
  try {
    replaceFileThrough(destination.GetString(), [&](int file) {
      job.file = file;
      outcome = transcode(job, problem);
      if (outcome != VideoOutcome::done) throw Unfinished();
    });
  } catch (Unfinished const&) {
    return outcome == VideoOutcome::failed && fail(problem);
  } catch (std::system_error const& error) {
    return fail(destination.GetString() + ": cannot be written: " + error.code().message());
  }
  return true;
}
