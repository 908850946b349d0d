// One track of sound: copied where the destination can hold it as it is, else encoded anew.
#pragma once

#include <optional>

#include "video/Destination.h"
#include "video/FilterGraph.h"
#include "video/Source.h"

namespace talix_video {

class AudioTrack {
 public:
  // Adds its stream to the destination.
  AudioTrack(Source const& source, AVStream const& in, Destination& destination);
  // Whether the destination can hold any sound.
  static bool canBeIn(Destination const& destination);

  void take(AVPacket& packet);
  void finish();

 private:
  void startEncoder();
  void decode(AVPacket const* packet);  // null: no more come, as below
  void filter(AVFrame* frame);
  void encode(AVFrame const* frame);

  Source const& m_source;
  AVStream const& m_in;
  Destination& m_destination;
  AVStream& m_out;
  int64_t m_lastTime = AV_NOPTS_VALUE;  // of copied packets
  CodecPtr m_decoder, m_encoder;        // null: copied
  std::optional<FilterGraph> m_filter;
};

}  // namespace talix_video
