// Which encoder makes the pictures, and how it is told about quality.
#pragma once

#include <string>

#include "video/Destination.h"

namespace talix_video {

// ENCODER or ENCODER:PRESET; empty: H.264, else MPEG-4, else what the container usually holds.
AVCodec const* findEncoder(std::string const& payload, Destination const& destination);
// Before it is opened. Quality: 1 to 100.
void setQuality(AVCodecContext& encoder, int quality);
// One that would tell about itself on standard error.
void silence(AVCodecContext& encoder);
// That of the payload, if any.
void setPreset(AVCodecContext& encoder, std::string const& payload);

// The formats that an encoder takes for pictures of a size, as the filter "format" takes them; `playable`:
// only those that players know.
std::string formatsFor(AVCodec const& codec, int width, int height, bool playable);
// The unit of time of an encoder for pictures that come at a rate, or at any time (`anyTime`) in the units of
// the stream that they are from.
AVRational timeBaseFor(AVCodec const& codec, AVRational rate, bool anyTime, AVRational from);

}  // namespace talix_video
