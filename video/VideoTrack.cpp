#include "video/VideoTrack.h"

#include <algorithm>
#include <cmath>
#include <unistd.h>

#include "video/Encoders.h"

namespace talix_video {

namespace {

constexpr char const kTimecodeKey[] = "talix_timecode";

int quarterTurns(AVStream const& stream) {
  uint8_t const* matrix = av_stream_get_side_data(&stream, AV_PKT_DATA_DISPLAYMATRIX, nullptr);
  if (!matrix) return 0;
  double const degrees = -av_display_rotation_get(reinterpret_cast<int32_t const*>(matrix));
  if (std::isnan(degrees)) return 0;
  return (static_cast<int>(std::lround(degrees / 90)) % 4 + 4) % 4;
}

void turn(FilterGraph& graph, int quarters) {
  switch ((quarters + 4) % 4) {
    case 1:
      return graph.add("transpose", {{"dir", "clock"}});
    case 2:
      graph.add("hflip");
      return graph.add("vflip");
    case 3:
      return graph.add("transpose", {{"dir", "cclock"}});
    default:
      return;
  }
}

}  // namespace

VideoTrack::VideoTrack(VideoJob const& job, Source const& source, Destination& destination)
    : m_job(job),
      m_source(source),
      m_destination(destination),
      m_in(source.getVideo()),
      m_decoder(openDecoder(m_in)),
      m_codec(findEncoder(job.payload, destination)),
      m_turn(quarterTurns(m_in)) {
  if (job.burnIn) {
    if (auto const start = source.getTimecode())
      m_timecode = Timecode::parse(*start, source.getTimecodeRate());
    if (!m_timecode) m_timecode.emplace(source.getTimecodeRate());
  }
  AVCodecParameters const& picture = *m_in.codecpar;
  if (picture.format < 0) throw VideoError("not a whole video: none of its pictures can be decoded");
  makeFilters(picture.width, picture.height, picture.format);
  makeStream();
}

void VideoTrack::makeFilters(int width, int height, int format) {
  AVRational const aspect =
      av_guess_sample_aspect_ratio(&m_source.getFormat(), const_cast<AVStream*>(&m_in), nullptr);
  AVRational const rate = m_source.getRate();
  m_lensFormat.reset();
  m_lensMap.reset();
  int filtered = format;
  if (m_job.lens) {
    m_lensFormat = pictureGraph(width, height, format, m_in.time_base, aspect, rate);
    m_lensFormat->add("format", {{"pix_fmts", LensMap::kFormats}});
    m_lensFormat->finish("buffersink");
    filtered = av_buffersink_get_format(m_lensFormat->getSink());
  }
  FilterGraph graph = pictureGraph(width, height, filtered, m_in.time_base, aspect, rate);
  if (m_job.saturation) graph.add("hue", {{"s", std::to_string(*m_job.saturation)}});
  if (m_job.gamma) graph.add("eq", {{"gamma", std::to_string(*m_job.gamma)}});
  if (m_job.burnIn) addTimecode(graph, width, height);
  // What the encoder was opened with stays.
  graph.add("format", {{"pix_fmts", m_encoder ? av_get_pix_fmt_name(m_encoder->pix_fmt)
                                              : formatsFor(*m_codec, width, height, m_job.payload[0] == 0)}});
  graph.finish("buffersink");
  m_filters = std::move(graph);
  m_width = width, m_height = height, m_format = format;
}

// Upright where players turn the picture.
void VideoTrack::addTimecode(FilterGraph& graph, int width, int height) const {
  static constexpr int kPartsOfHeight[] = {40, 30, 20, 14, 10};
  static char const* const kFonts[] = {"/usr/share/fonts/truetype/dejavu/DejaVuSansMono.ttf",
                                       "/usr/share/fonts/truetype/dejavu/DejaVuSans.ttf"};
  Nex::IBurnInTimecodeSettings const& settings = *m_job.burnIn;
  int const parts = kPartsOfHeight[std::clamp(settings.size, 0, 4)];
  if (m_turn % 2) std::swap(width, height);
  // Eight letters' height is more than what the box is wide.
  int const letters = std::max(1, std::min(std::max(8, height / parts), width / 8));
  std::string const border = std::to_string(settings.box ? std::max(1, letters / 4) : 0);
  // The box keeps the margin, as far as the picture is large enough.
  auto const place = [&](int margin, char const* picture, char const* text, int side) {
    std::string const free = std::string(picture) + "-" + text + "-2*" + border;
    std::string const near = "min(" + std::to_string(margin) + ",max(0," + free + "))";
    std::string const at = side == 0 ? near : side == 1 ? "(" + free + ")/2" : free + "-" + near;
    return "floor(" + border + "+max(0," + at + "))";
  };
  int const position = std::clamp(settings.position, 0, 5);
  FilterOption font{"font", "monospace"};
  for (char const* file : kFonts)
    if (::access(file, R_OK) == 0) {
      font = {"fontfile", file};
      break;
    }
  turn(graph, m_turn);
  graph.add("drawtext", {font,
                         {"text", std::string("%{metadata:") + kTimecodeKey + "}"},
                         {"fontsize", std::to_string(letters)},
                         {"fontcolor", "white"},
                         {"box", settings.box ? "1" : "0"},
                         {"boxcolor", "black@0.6"},
                         {"boxborderw", border},
                         {"x", place(settings.marginX, "w", "tw", position % 3)},
                         {"y", place(settings.marginY, "h", "th", position / 3 * 2)}});
  turn(graph, -m_turn);
}

void VideoTrack::makeStream() {
  AVFilterContext const* sink = m_filters->getSink();
  m_encoder = owned<CodecPtr>(avcodec_alloc_context3(m_codec));
  m_encoder->width = av_buffersink_get_w(sink);
  m_encoder->height = av_buffersink_get_h(sink);
  m_encoder->pix_fmt = static_cast<AVPixelFormat>(av_buffersink_get_format(sink));
  m_encoder->sample_aspect_ratio = av_buffersink_get_sample_aspect_ratio(sink);
  m_encoder->framerate = m_source.getRate();
  m_encoder->time_base = timeBaseFor(*m_codec, m_source.getRate(), m_destination.hasTimes(), m_in.time_base);
  AVPixFmtDescriptor const* format = av_pix_fmt_desc_get(m_encoder->pix_fmt);
  AVCodecParameters const& picture = *m_in.codecpar;
  AVPixFmtDescriptor const* former = av_pix_fmt_desc_get(static_cast<AVPixelFormat>(picture.format));
  auto const isRgb = [](AVPixFmtDescriptor const* kind) { return kind && kind->flags & AV_PIX_FMT_FLAG_RGB; };
  if (isRgb(former) == isRgb(format)) {
    m_encoder->color_range = picture.color_range;
    m_encoder->colorspace = picture.color_space;
  } else if (isRgb(former)) {
    m_encoder->colorspace = AVCOL_SPC_SMPTE170M;  // what the filters make of it
  }
  m_encoder->color_primaries = picture.color_primaries;
  m_encoder->color_trc = picture.color_trc;
  m_encoder->chroma_sample_location = picture.chroma_location;
  m_encoder->thread_count = 0;
  // Such containers hold no times of display.
  if (!m_destination.hasTimes()) m_encoder->max_b_frames = 0;
  if (m_destination.getKind().flags & AVFMT_GLOBALHEADER) m_encoder->flags |= AV_CODEC_FLAG_GLOBAL_HEADER;
  setQuality(*m_encoder, m_job.quality);
  silence(*m_encoder);
  setPreset(*m_encoder, m_job.payload);
  check(avcodec_open2(m_encoder.get(), m_codec, nullptr),
        std::string("the encoder ") + m_codec->name + " does not start");

  AVStream& out = m_destination.addStream();
  m_out = &out;
  check(avcodec_parameters_from_context(out.codecpar, m_encoder.get()), "bad parameters");
  out.time_base = m_encoder->time_base;
  out.avg_frame_rate = out.r_frame_rate = m_source.getRate();
  out.sample_aspect_ratio = m_encoder->sample_aspect_ratio;
  out.disposition = m_in.disposition & AV_DISPOSITION_DEFAULT;
  check(av_dict_copy(&out.metadata, m_in.metadata, 0), "the metadata");
  av_dict_set(&out.metadata, "encoder", nullptr, 0);
  size_t size = 0;
  if (uint8_t const* matrix = av_stream_get_side_data(&m_in, AV_PKT_DATA_DISPLAYMATRIX, &size)) {
    uint8_t* copy = av_stream_new_side_data(&out, AV_PKT_DATA_DISPLAYMATRIX, size);
    if (!copy) throw std::bad_alloc();
    std::copy(matrix, matrix + size, copy);
  }
}

void VideoTrack::finish() {
  decode(nullptr);
  if (!m_any) throw VideoError("not a whole video: none of its pictures can be decoded");
  m_filters->run(nullptr, [&](AVFrame& frame) { encode(&frame); });
  encode(nullptr);
}

void VideoTrack::decode(AVPacket const* packet) {
  FramePtr frame = newFrame();
  int const sent = avcodec_send_packet(m_decoder.get(), packet);
  // Recordings of broadcasts begin with pictures that lack what they build on.
  if (sent < 0 && sent != AVERROR_EOF && !(sent == AVERROR_INVALIDDATA && !m_any))
    fail("a picture is damaged after " + std::to_string(secondsOf(m_lastIn)) + " s", sent);
  for (;;) {
    int const result = avcodec_receive_frame(m_decoder.get(), frame.get());
    if (result == AVERROR(EAGAIN) || result == AVERROR_EOF) return;
    if (result == AVERROR_INVALIDDATA && !m_any) return;
    check(result, "a picture is damaged");
    m_any = true;
    filter(*frame);
    av_frame_unref(frame.get());
  }
}

void VideoTrack::filter(AVFrame& frame) {
  if (frame.width != m_width || frame.height != m_height)
    throw VideoError("the size of the pictures changes within the file");
  if (frame.format != m_format) makeFilters(frame.width, frame.height, frame.format);
  frame.pts = frame.best_effort_timestamp;
  AVRational const unit = av_inv_q(m_source.getRate());
  if (frame.pts == AV_NOPTS_VALUE) {
    int64_t const step = std::max<int64_t>(1, av_rescale_q(1, unit, m_in.time_base));
    frame.pts = m_lastIn == AV_NOPTS_VALUE ? m_source.getStart(m_in) : m_lastIn + step;
  }
  m_lastIn = frame.pts;
  if (m_firstIn == AV_NOPTS_VALUE) m_firstIn = frame.pts;
  if (m_timecode) {
    int64_t const number =
        av_rescale_q(frame.pts - m_firstIn, m_in.time_base, av_inv_q(m_source.getTimecodeRate()));
    check(av_dict_set(&frame.metadata, kTimecodeKey, m_timecode->at(number).c_str(), 0), "the timecode");
  }
  FramePtr const straight = m_job.lens ? corrected(frame) : nullptr;
  m_filters->run(straight ? straight.get() : &frame, [&](AVFrame& changed) { encode(&changed); });
}

FramePtr VideoTrack::corrected(AVFrame& frame) {
  FramePtr made;
  m_lensFormat->run(&frame, [&](AVFrame const& planes) {
    if (!m_lensMap || !m_lensMap->fits(planes))
      m_lensMap.emplace(*m_job.lens, m_job.undistort, m_job.centre, planes);
    made = m_lensMap->apply(planes);
  });
  if (!made) throw VideoError("the filters give no picture");
  return made;
}

// In the encoder's units.
int64_t VideoTrack::timeOf(AVFrame const& frame) {
  AVRational const unit = av_inv_q(m_source.getRate()), from = m_in.time_base, to = m_encoder->time_base;
  int64_t const time = frame.pts - m_source.getStart(m_in);
  int64_t const number = av_rescale_q(time, from, unit);
  // Where the source rounds times, pictures that come at the rate go back to it.
  bool const fine = av_rescale_q(1, unit, from) >= 8;
  bool const regular = fine && std::abs(av_rescale_q(number, unit, from) - time) <= 1;
  int64_t out = regular ? av_rescale_q(number, unit, to) : av_rescale_q(time, from, to);
  if (m_lastOut != AV_NOPTS_VALUE) out = std::max(out, m_lastOut + 1);
  return m_lastOut = out;
}

void VideoTrack::encode(AVFrame* frame) {
  if (frame) {
    int64_t const length = av_rescale_q(frame->pkt_duration, m_in.time_base, m_encoder->time_base);
    frame->pts = timeOf(*frame);
    frame->pict_type = AV_PICTURE_TYPE_NONE;
    frame->quality = m_encoder->global_quality;
    m_durations[frame->pts] = length;
  }
  encodeInto(*m_encoder, frame, [&](AVPacket& packet) {
    // Encoders keep many pictures until the end.
    if (!m_job.goOn(m_source.getDone())) throw Cancelled();
    if (auto const length = m_durations.extract(packet.pts)) packet.duration = length.mapped();
    if (packet.duration <= 0)
      packet.duration =
          std::max<int64_t>(1, av_rescale_q(1, av_inv_q(m_source.getRate()), m_encoder->time_base));
    m_destination.write(packet, *m_out, m_encoder->time_base);
  });
}

double VideoTrack::secondsOf(int64_t time) const {
  return time == AV_NOPTS_VALUE
             ? 0
             : static_cast<double>(time - m_source.getStart(m_in)) * av_q2d(m_in.time_base);
}

}  // namespace talix_video
