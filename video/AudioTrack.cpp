#include "video/AudioTrack.h"

#include <algorithm>

namespace talix_video {

namespace {

AVCodec const* encoderFor(Destination const& destination) {
  if (destination.canHold(AV_CODEC_ID_AAC)) return avcodec_find_encoder(AV_CODEC_ID_AAC);
  return avcodec_find_encoder(destination.getKind().audio_codec);
}

int rateFor(AVCodec const& codec, int wanted) {
  int best = wanted;
  for (int const* rate = codec.supported_samplerates; rate && *rate; ++rate)
    if (rate == codec.supported_samplerates || std::abs(*rate - wanted) < std::abs(best - wanted))
      best = *rate;
  return best;
}

// The encoder's own one with the same number of channels, else its largest that has fewer.
AVChannelLayout layoutFor(AVCodec const& codec, AVChannelLayout const& wanted) {
  AVChannelLayout best{};
  if (!codec.ch_layouts) {
    av_channel_layout_default(&best, std::max(1, wanted.nb_channels));
    return best;
  }
  for (AVChannelLayout const* layout = codec.ch_layouts; layout->nb_channels; ++layout)
    if (layout->nb_channels <= wanted.nb_channels && layout->nb_channels > best.nb_channels) best = *layout;
  return best.nb_channels ? best : codec.ch_layouts[0];
}

std::string nameOf(AVChannelLayout const& layout) {
  char text[128] = "";
  av_channel_layout_describe(&layout, text, sizeof text);
  return text;
}

}  // namespace

bool AudioTrack::canBeIn(Destination const& destination) { return encoderFor(destination) != nullptr; }

AudioTrack::AudioTrack(Source const& source, AVStream const& in, Destination& destination)
    : m_source(source), m_in(in), m_destination(destination), m_out(destination.addStream()) {
  if (destination.canHold(in.codecpar->codec_id)) {
    check(avcodec_parameters_copy(m_out.codecpar, in.codecpar), "bad parameters");
    // Containers name codecs each in its own way.
    m_out.codecpar->codec_tag = 0;
    m_out.time_base = in.time_base;
  } else {
    startEncoder();
  }
  m_out.disposition = in.disposition & AV_DISPOSITION_DEFAULT;
  check(av_dict_copy(&m_out.metadata, in.metadata, 0), "the metadata");
  av_dict_set(&m_out.metadata, "encoder", nullptr, 0);
}

void AudioTrack::startEncoder() {
  AVCodec const* codec = encoderFor(m_destination);
  m_decoder = openDecoder(m_in);
  m_encoder = owned<CodecPtr>(avcodec_alloc_context3(codec));
  if (m_decoder->ch_layout.order == AV_CHANNEL_ORDER_UNSPEC)
    av_channel_layout_default(&m_decoder->ch_layout, std::max(1, m_decoder->ch_layout.nb_channels));
  m_encoder->sample_rate = rateFor(*codec, m_decoder->sample_rate);
  m_encoder->sample_fmt = codec->sample_fmts ? codec->sample_fmts[0] : m_decoder->sample_fmt;
  m_encoder->ch_layout = layoutFor(*codec, m_decoder->ch_layout);
  m_encoder->time_base = {1, m_encoder->sample_rate};
  if (m_destination.getKind().flags & AVFMT_GLOBALHEADER) m_encoder->flags |= AV_CODEC_FLAG_GLOBAL_HEADER;
  check(avcodec_open2(m_encoder.get(), codec, nullptr), "the encoder of the sound does not start");

  m_filter.emplace("abuffer", std::initializer_list<FilterOption>{
                                  {"sample_rate", std::to_string(m_decoder->sample_rate)},
                                  {"sample_fmt", av_get_sample_fmt_name(m_decoder->sample_fmt)},
                                  {"channel_layout", nameOf(m_decoder->ch_layout)},
                                  {"time_base", textOf(m_in.time_base)}});
  m_filter->add("aformat", {{"sample_rates", std::to_string(m_encoder->sample_rate)},
                            {"sample_fmts", av_get_sample_fmt_name(m_encoder->sample_fmt)},
                            {"channel_layouts", nameOf(m_encoder->ch_layout)}});
  m_filter->finish("abuffersink");
  if (!(codec->capabilities & AV_CODEC_CAP_VARIABLE_FRAME_SIZE))
    av_buffersink_set_frame_size(m_filter->getSink(), static_cast<unsigned>(m_encoder->frame_size));
  check(avcodec_parameters_from_context(m_out.codecpar, m_encoder.get()), "bad parameters");
  m_out.time_base = m_encoder->time_base;
}

void AudioTrack::take(AVPacket& packet) {
  int64_t const start = m_source.getStart(m_in);
  if (packet.pts != AV_NOPTS_VALUE) packet.pts -= start;
  if (packet.dts != AV_NOPTS_VALUE) packet.dts -= start;
  if (m_encoder) return decode(&packet);
  // Containers take only times that rise.
  if (packet.dts != AV_NOPTS_VALUE) {
    if (m_lastTime != AV_NOPTS_VALUE) packet.dts = std::max(packet.dts, m_lastTime + 1);
    if (packet.pts != AV_NOPTS_VALUE) packet.pts = std::max(packet.pts, packet.dts);
    m_lastTime = packet.dts;
  }
  m_destination.write(packet, m_out, m_in.time_base);
}

void AudioTrack::finish() {
  if (!m_encoder) return;
  decode(nullptr);
  filter(nullptr);
  encode(nullptr);
}

void AudioTrack::decode(AVPacket const* packet) {
  int const sent = avcodec_send_packet(m_decoder.get(), packet);
  // A damaged bit of sound is left out.
  if (sent < 0 && sent != AVERROR_INVALIDDATA && sent != AVERROR_EOF)
    fail("the sound cannot be decoded", sent);
  FramePtr frame = newFrame();
  for (;;) {
    int const result = avcodec_receive_frame(m_decoder.get(), frame.get());
    if (result == AVERROR(EAGAIN) || result == AVERROR_EOF || result == AVERROR_INVALIDDATA) return;
    check(result, "the sound cannot be decoded");
    frame->pts = frame->best_effort_timestamp;
    if (frame->ch_layout.order == AV_CHANNEL_ORDER_UNSPEC)
      av_channel_layout_copy(&frame->ch_layout, &m_decoder->ch_layout);
    filter(frame.get());
    av_frame_unref(frame.get());
  }
}

void AudioTrack::filter(AVFrame* frame) {
  m_filter->run(frame, [&](AVFrame& made) {
    AVRational const from = av_buffersink_get_time_base(m_filter->getSink());
    if (made.pts != AV_NOPTS_VALUE) made.pts = av_rescale_q(made.pts, from, m_encoder->time_base);
    encode(&made);
  });
}

void AudioTrack::encode(AVFrame const* frame) {
  encodeInto(*m_encoder, frame,
             [&](AVPacket& packet) { m_destination.write(packet, m_out, m_encoder->time_base); });
}

}  // namespace talix_video
