#include "tests/video/VideoFile.h"

#include <cstring>
#include <numeric>
#include <stdexcept>

extern "C" {
#include <libavcodec/avcodec.h>
#include <libavformat/avformat.h>
#include <libavutil/display.h>
}

namespace {

constexpr int kSoundRate = 48000;

int must(int result) {
  return result < 0 ? throw std::runtime_error("FFmpeg: " + std::to_string(result)) : result;
}

// The pixels of a plane, without what pads its rows.
std::vector<uint8_t> pixels(AVFrame const& frame, int plane, int width, int height) {
  std::vector<uint8_t> all;
  for (int row = 0; row < height; ++row) {
    uint8_t const* from = frame.data[plane] + row * frame.linesize[plane];
    all.insert(all.end(), from, from + width);
  }
  return all;
}

void copyPlane(std::vector<uint8_t> const& from, AVFrame& to, int plane, int width) {
  for (size_t row = 0; row * static_cast<size_t>(width) < from.size(); ++row)
    std::memcpy(to.data[plane] + static_cast<int>(row) * to.linesize[plane],
                &from[row * static_cast<size_t>(width)], static_cast<size_t>(width));
}

}  // namespace

double VideoFile::Picture::mean(std::vector<uint8_t> const& plane) const {
  return std::accumulate(plane.begin(), plane.end(), 0.0) / static_cast<double>(plane.size());
}

VideoFile VideoFile::plain(int count) {
  VideoFile file;
  for (int i = 0; i < count; ++i) {
    Picture picture{i / 25.0, std::vector<uint8_t>(kWidth * kHeight, static_cast<uint8_t>(80 + i)),
                    std::vector<uint8_t>(kWidth * kHeight / 4, 90),
                    std::vector<uint8_t>(kWidth * kHeight / 4, 170)};
    for (size_t row = 32; row < 40; ++row)
      for (size_t column = 48; column < 56; ++column) picture.y[row * kWidth + column] = 230;
    file.pictures.push_back(picture);
  }
  return file;
}

void VideoFile::write(std::string const& path) const {
  AVFormatContext* format = nullptr;
  must(avformat_alloc_output_context2(&format, nullptr, nullptr, path.c_str()));
  must(avio_open(&format->pb, path.c_str(), AVIO_FLAG_WRITE));
  AVCodec const* codec = avcodec_find_encoder(AV_CODEC_ID_MPEG4);
  AVCodecContext* encoder = avcodec_alloc_context3(codec);
  encoder->width = kWidth, encoder->height = kHeight, encoder->pix_fmt = AV_PIX_FMT_YUV420P;
  // Pictures may begin between two frames, but not in this container.
  int const parts = format->oformat->name == std::string("avi") ? 1 : 2;
  encoder->time_base = {perSeconds, rate * parts}, encoder->framerate = {rate, perSeconds};
  encoder->sample_aspect_ratio = {aspect, 1};
  encoder->flags |=
      AV_CODEC_FLAG_QSCALE | (format->oformat->flags & AVFMT_GLOBALHEADER ? AV_CODEC_FLAG_GLOBAL_HEADER : 0);
  encoder->global_quality = FF_QP2LAMBDA * 2;
  must(avcodec_open2(encoder, codec, nullptr));
  AVStream* video = avformat_new_stream(format, nullptr);
  must(avcodec_parameters_from_context(video->codecpar, encoder));
  video->time_base = encoder->time_base, video->avg_frame_rate = encoder->framerate;
  video->sample_aspect_ratio = encoder->sample_aspect_ratio;
  if (!timecode.empty()) av_dict_set(&video->metadata, "timecode", timecode.c_str(), 0);
  if (turned) {
    uint8_t* matrix = av_stream_new_side_data(video, AV_PKT_DATA_DISPLAYMATRIX, 36);
    av_display_rotation_set(reinterpret_cast<int32_t*>(matrix), 90);
  }
  AVStream* audio = sound.empty() ? nullptr : avformat_new_stream(format, nullptr);
  if (audio) {
    audio->codecpar->codec_type = AVMEDIA_TYPE_AUDIO, audio->codecpar->codec_id = AV_CODEC_ID_PCM_S16LE;
    audio->codecpar->sample_rate = kSoundRate, audio->codecpar->format = AV_SAMPLE_FMT_S16;
    audio->codecpar->block_align = 4, audio->codecpar->bits_per_coded_sample = 16;
    av_channel_layout_default(&audio->codecpar->ch_layout, 2);
    audio->time_base = {1, kSoundRate};
  }
  must(avformat_write_header(format, nullptr));
  AVPacket* packet = av_packet_alloc();
  AVFrame* frame = av_frame_alloc();
  for (Picture const& picture : pictures) {
    av_frame_unref(frame);
    frame->width = kWidth, frame->height = kHeight, frame->format = AV_PIX_FMT_YUV420P;
    must(av_frame_get_buffer(frame, 0));
    copyPlane(picture.y, *frame, 0, kWidth);
    copyPlane(picture.u, *frame, 1, kWidth / 2);
    copyPlane(picture.v, *frame, 2, kWidth / 2);
    frame->pts = static_cast<int64_t>(picture.time * rate * parts / perSeconds + 0.5);
    must(avcodec_send_frame(encoder, frame));
    while (avcodec_receive_packet(encoder, packet) >= 0) {
      packet->duration = parts;
      av_packet_rescale_ts(packet, encoder->time_base, video->time_base);
      must(av_interleaved_write_frame(format, packet));
    }
    if (!audio) continue;
    must(av_new_packet(packet, 4 * kSoundRate * perSeconds / rate));
    std::memset(packet->data, static_cast<int>(frame->pts), static_cast<size_t>(packet->size));
    packet->stream_index = audio->index;
    packet->pts = packet->dts = static_cast<int64_t>(picture.time * kSoundRate + 0.5);
    packet->duration = packet->size / 4;
    av_packet_rescale_ts(packet, {1, kSoundRate}, audio->time_base);
    must(av_interleaved_write_frame(format, packet));
  }
  must(av_write_trailer(format));
  av_packet_free(&packet);
  av_frame_free(&frame);
  avcodec_free_context(&encoder);
  avio_closep(&format->pb);
  avformat_free_context(format);
}

VideoFile VideoFile::read(std::string const& path) {
  VideoFile file;
  AVFormatContext* format = nullptr;
  must(avformat_open_input(&format, path.c_str(), nullptr, nullptr));
  must(avformat_find_stream_info(format, nullptr));
  AVCodec const* codec = nullptr;
  AVStream const* video =
      format->streams[must(av_find_best_stream(format, AVMEDIA_TYPE_VIDEO, -1, -1, &codec, 0))];
  AVCodecContext* decoder = avcodec_alloc_context3(codec);
  must(avcodec_parameters_to_context(decoder, video->codecpar));
  must(avcodec_open2(decoder, codec, nullptr));
  file.rate = video->avg_frame_rate.num, file.perSeconds = video->avg_frame_rate.den;
  file.aspect = video->sample_aspect_ratio.num;
  if (auto const* entry = av_dict_get(video->metadata, "timecode", nullptr, 0)) file.timecode = entry->value;
  auto const* matrix =
      reinterpret_cast<int32_t const*>(av_stream_get_side_data(video, AV_PKT_DATA_DISPLAYMATRIX, nullptr));
  file.turned = matrix && av_display_rotation_get(matrix) == -90;
  AVPacket* packet = av_packet_alloc();
  AVFrame* frame = av_frame_alloc();
  auto const decode = [&](AVPacket const* given) {
    must(avcodec_send_packet(decoder, given));
    while (avcodec_receive_frame(decoder, frame) >= 0) {
      int const w = frame->width, h = frame->height;
      file.pictures.push_back({static_cast<double>(frame->best_effort_timestamp) * av_q2d(video->time_base),
                               pixels(*frame, 0, w, h), pixels(*frame, 1, w / 2, h / 2),
                               pixels(*frame, 2, w / 2, h / 2), w, h});
    }
  };
  while (av_read_frame(format, packet) >= 0) {
    AVCodecParameters const& of = *format->streams[packet->stream_index]->codecpar;
    if (packet->stream_index == video->index) {
      decode(packet);
    } else if (of.codec_type == AVMEDIA_TYPE_AUDIO) {
      file.sound = avcodec_get_name(of.codec_id);
      file.soundBytes += static_cast<size_t>(packet->size);
    }
    av_packet_unref(packet);
  }
  decode(nullptr);
  av_packet_free(&packet);
  av_frame_free(&frame);
  avcodec_free_context(&decoder);
  avformat_close_input(&format);
  return file;
}
