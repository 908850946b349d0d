// FFmpeg's libraries with owners for what they allocate and exceptions for what they refuse.
#pragma once

extern "C" {
#include <libavcodec/avcodec.h>
#include <libavfilter/avfilter.h>
#include <libavfilter/buffersink.h>
#include <libavfilter/buffersrc.h>
#include <libavformat/avformat.h>
#include <libavutil/display.h>
#include <libavutil/opt.h>
#include <libavutil/pixdesc.h>
#include <libavutil/timecode.h>
}

#include <memory>
#include <new>
#include <stdexcept>
#include <string>

namespace talix_video {

// Why a video cannot be transcoded, in words for the user.
struct VideoError : std::runtime_error {
  using std::runtime_error::runtime_error;
};
struct Cancelled {};

// From now on FFmpeg's own lines go nowhere, but the last error is kept until it is asked for.
void keepLogQuiet();

// `what`, then FFmpeg's last error line, else what the code stands for.
[[noreturn]] void fail(std::string const& what, int code);
inline int check(int code, std::string const& what) { return code < 0 ? fail(what, code) : void(), code; }

template <auto kFree>
struct Freer {
  template <class T>
  void operator()(T* object) const {
    kFree(&object);
  }
};
using FramePtr = std::unique_ptr<AVFrame, Freer<av_frame_free>>;
using PacketPtr = std::unique_ptr<AVPacket, Freer<av_packet_free>>;
using CodecPtr = std::unique_ptr<AVCodecContext, Freer<avcodec_free_context>>;
using GraphPtr = std::unique_ptr<AVFilterGraph, Freer<avfilter_graph_free>>;

template <class Owner>
Owner owned(typename Owner::pointer object) {
  if (!object) throw std::bad_alloc();
  return Owner(object);
}
inline FramePtr newFrame() { return owned<FramePtr>(av_frame_alloc()); }
inline PacketPtr newPacket() { return owned<PacketPtr>(av_packet_alloc()); }

// As a format's io_open: it has the one file that it was given.
int refuseOtherFiles(AVFormatContext*, AVIOContext**, char const*, int, AVDictionary**);

// Calls use(packet) for each packet that an encoder has after a picture or sound (null: no more come).
template <class Use>
void encodeInto(AVCodecContext& encoder, AVFrame const* frame, Use use) {
  std::string const what = std::string("the encoder ") + encoder.codec->name + " fails";
  check(avcodec_send_frame(&encoder, frame), what);
  PacketPtr packet = newPacket();
  for (;;) {
    int const result = avcodec_receive_packet(&encoder, packet.get());
    if (result == AVERROR(EAGAIN) || result == AVERROR_EOF) return;
    check(result, what);
    use(*packet);
    av_packet_unref(packet.get());
  }
}

// A decoder for a stream, ready.
CodecPtr openDecoder(AVStream const& stream);

}  // namespace talix_video
