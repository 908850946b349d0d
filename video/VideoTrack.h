// The pictures: decoded, changed, encoded.
#pragma once

#include <map>
#include <optional>

#include "host/services/VideoJob.h"
#include "video/Destination.h"
#include "video/FilterGraph.h"
#include "video/LensMap.h"
#include "video/Source.h"
#include "video/Timecode.h"

namespace talix_video {

class VideoTrack {
 public:
  // Adds its stream to the destination.
  VideoTrack(VideoJob const& job, Source const& source, Destination& destination);

  void take(AVPacket const& packet) { decode(&packet); }
  void finish();

 private:
  void makeFilters(int width, int height, int format);
  void addTimecode(FilterGraph& graph, int width, int height) const;
  void makeStream();
  void decode(AVPacket const* packet);  // null: no more come
  void filter(AVFrame& frame);
  FramePtr corrected(AVFrame& frame);
  void encode(AVFrame* frame);  // null: no more come
  int64_t timeOf(AVFrame const& frame);
  double secondsOf(int64_t time) const;

  VideoJob const& m_job;
  Source const& m_source;
  Destination& m_destination;
  AVStream const& m_in;
  CodecPtr m_decoder;
  AVCodec const* m_codec;
  CodecPtr m_encoder;
  AVStream* m_out = nullptr;
  std::optional<FilterGraph> m_lensFormat, m_filters;
  std::optional<LensMap> m_lensMap;
  std::optional<Timecode> m_timecode;
  int m_width = 0, m_height = 0, m_format = -1;  // of what the filters take
  int m_turn = 0;                                // how far players turn it, in quarters clockwise
  bool m_any = false;                            // whether a picture was decoded
  int64_t m_lastIn = AV_NOPTS_VALUE, m_lastOut = AV_NOPTS_VALUE;
  int64_t m_firstIn = AV_NOPTS_VALUE;
  std::map<int64_t, int64_t> m_durations;  // of pictures in the encoder, by their time
};

}  // namespace talix_video
