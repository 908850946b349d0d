#include "video/Encoders.h"

#include <algorithm>
#include <cmath>
#include <string_view>

namespace talix_video {

namespace {

constexpr std::string_view kX26Presets[] = {"ultrafast", "superfast", "veryfast", "faster",   "fast",
                                            "medium",    "slow",      "slower",   "veryslow", "placebo"};

}  // namespace

AVCodec const* findEncoder(std::string const& payload, Destination const& destination) {
  if (!payload.empty()) {
    std::string const name = payload.substr(0, payload.find(':'));
    AVCodec const* codec = avcodec_find_encoder_by_name(name.c_str());
    if (!codec || codec->type != AVMEDIA_TYPE_VIDEO)
      throw VideoError("there is no video encoder \"" + name + "\"");
    if (!destination.canHold(codec->id))
      throw VideoError("a " + destination.getSuffix() + " file cannot hold what " + name + " encodes");
    return codec;
  }
  for (char const* name : {"libx264", "libopenh264", "mpeg4"})
    if (AVCodec const* codec = avcodec_find_encoder_by_name(name); codec && destination.canHold(codec->id))
      return codec;
  if (AVCodec const* codec = avcodec_find_encoder(destination.getKind().video_codec)) return codec;
  throw VideoError("there is no encoder for a " + destination.getSuffix() + " file");
}

void setQuality(AVCodecContext& encoder, int quality) {
  std::string_view const name = encoder.codec->name;
  auto const set = [&](char const* option, double value) {
    check(av_opt_set_double(encoder.priv_data, option, value, 0), "the quality cannot be set");
  };
  double const crf = 51 - 0.4 * quality;
  if (name == "libx264" || name == "libx265") return set("crf", crf);
  if (name.starts_with("libvpx") || name == "libaom-av1" || name == "libsvtav1") {
    encoder.bit_rate = 0;
    return set("crf", std::lround(63 - 0.5 * quality));
  }
  if (name == "libopenh264") {
    encoder.qmin = encoder.qmax = static_cast<int>(std::lround(crf));
    return;
  }
  encoder.flags |= AV_CODEC_FLAG_QSCALE;
  encoder.global_quality = static_cast<int>(std::lround(FF_QP2LAMBDA * (31 - (quality - 1) * 30 / 99.0)));
}

void silence(AVCodecContext& encoder) {
  if (std::string_view(encoder.codec->name) == "libx265")
    av_opt_set(encoder.priv_data, "x265-params", "log-level=none", 0);
}

void setPreset(AVCodecContext& encoder, std::string const& payload) {
  size_t const colon = payload.find(':');
  if (colon == std::string::npos) return;
  std::string const preset = payload.substr(colon + 1);
  bool known = true;
  // These two would print on standard error that they do not know it.
  if (std::string_view const name = encoder.codec->name; name == "libx264" || name == "libx265")
    known = std::find(std::begin(kX26Presets), std::end(kX26Presets), preset) != std::end(kX26Presets);
  if (!known || !encoder.priv_data || av_opt_set(encoder.priv_data, "preset", preset.c_str(), 0) < 0)
    throw VideoError(std::string(encoder.codec->name) + " has no preset \"" + preset + "\"");
}

std::string formatsFor(AVCodec const& codec, int width, int height, bool playable) {
  std::string names, plain;
  auto const add = [](std::string& list, char const* name) {
    list += (list.empty() ? "" : "|") + std::string(name);
  };
  for (AVPixelFormat const* format = codec.pix_fmts; format && *format != AV_PIX_FMT_NONE; ++format) {
    AVPixFmtDescriptor const* about = av_pix_fmt_desc_get(*format);
    if (!about || about->flags & AV_PIX_FMT_FLAG_HWACCEL) continue;
    // H.264 holds whole pixels of colour only.
    bool const whole = width % (1 << about->log2_chroma_w) == 0 && height % (1 << about->log2_chroma_h) == 0;
    if (codec.id == AV_CODEC_ID_H264 && !whole) continue;
    // JPEGs use the full range.
    if (codec.id == AV_CODEC_ID_MJPEG && !std::string_view(about->name).starts_with("yuvj")) continue;
    add(names, about->name);
    if (*format == AV_PIX_FMT_YUV420P || *format == AV_PIX_FMT_YUVJ420P) add(plain, about->name);
  }
  if (playable && !plain.empty()) return plain;
  return names.empty() ? "yuv420p" : names;
}

AVRational timeBaseFor(AVCodec const& codec, AVRational rate, bool anyTime, AVRational from) {
  if (!anyTime || codec.supported_framerates || av_cmp_q(from, av_inv_q(rate)) == 0) return av_inv_q(rate);
  // MPEG-4 counts the parts of a second in 16 bits.
  bool const narrow = codec.id == AV_CODEC_ID_MPEG4 || codec.id == AV_CODEC_ID_H263;
  int const most = narrow ? 65535 : 120'000;
  bool const fits = from.num == 1 && from.den > 1000 && from.den <= most;
  if (fits && int64_t{from.den} * rate.den % rate.num == 0) return from;
  // The finest one in which frames of the rate begin at whole units.
  return {1, rate.num <= most ? most / rate.num * rate.num : most};
}

}  // namespace talix_video
