#include "video/Destination.h"

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <iterator>
#include <string_view>
#include <sys/stat.h>
#include <unistd.h>

namespace talix_video {

namespace {

constexpr int kBufferSize = 1 << 16;

std::string suffixOf(std::string const& name) {
  size_t const dot = name.find_last_of("./");
  return dot == std::string::npos || name[dot] == '/' ? "" : name.substr(dot);
}

}  // namespace

Destination::Destination(std::string const& name, int file) : m_suffix(suffixOf(name)), m_file(file) {
  AVOutputFormat const* kind = av_guess_format(nullptr, ("video" + m_suffix).c_str(), nullptr);
  // Formats of several files, and of sound with a cover.
  if (!kind || kind->flags & AVFMT_NOFILE || kind->video_codec == AV_CODEC_ID_NONE ||
      kind->video_codec == AV_CODEC_ID_PNG)
    throw VideoError("\"" + m_suffix + "\" is the suffix of no video file");
  check(avformat_alloc_output_context2(&m_format, kind, nullptr, name.c_str()), "no such container");
  m_format->io_open = &refuseOtherFiles;
  auto* buffer = static_cast<unsigned char*>(av_malloc(kBufferSize));
  if (buffer) m_format->pb = avio_alloc_context(buffer, kBufferSize, 1, this, nullptr, &writeBytes, &seek);
  if (m_format->pb) return;
  av_free(buffer);
  release();
  throw std::bad_alloc();
}

Destination::~Destination() { release(); }

void Destination::release() {
  if (m_format->pb) {
    av_freep(&m_format->pb->buffer);
    avio_context_free(&m_format->pb);
  }
  avformat_free_context(m_format);
}

bool Destination::hasTimes() const {
  if (getKind().flags & AVFMT_NOTIMESTAMPS) return false;
  if (getKind().flags & AVFMT_VARIABLE_FPS) return true;
  // The containers of one family do not say so.
  for (std::string_view const name : {"mov", "mp4", "ipod", "psp", "3gp", "3g2", "f4v"})
    if (name == getKind().name) return true;
  return false;
}

bool Destination::canHold(AVCodecID codec) const {
  // Some keep no list, and the list of one promises too much.
  static constexpr struct {
    std::string_view container;
    AVCodecID codecs[6];
  } kKnown[] = {
      {"mpegts",
       {AV_CODEC_ID_H264, AV_CODEC_ID_MPEG4, AV_CODEC_ID_AAC, AV_CODEC_ID_MP2, AV_CODEC_ID_MP3,
        AV_CODEC_ID_AC3}},
      {"mpeg", {AV_CODEC_ID_H264, AV_CODEC_ID_MPEG4, AV_CODEC_ID_MP2, AV_CODEC_ID_MP3, AV_CODEC_ID_AC3}},
      {"vob", {AV_CODEC_ID_H264, AV_CODEC_ID_MPEG4, AV_CODEC_ID_MP2, AV_CODEC_ID_MP3, AV_CODEC_ID_AC3}},
      {"flv", {AV_CODEC_ID_H264, AV_CODEC_ID_AAC, AV_CODEC_ID_MP3}}};
  if (codec == getKind().video_codec || codec == getKind().audio_codec) return true;
  for (auto const& known : kKnown)
    if (known.container == getKind().name)
      return std::find(std::begin(known.codecs), std::end(known.codecs), codec) != std::end(known.codecs);
  return avformat_query_codec(&getKind(), codec, FF_COMPLIANCE_NORMAL) == 1;
}

AVStream& Destination::addStream() {
  AVStream* stream = avformat_new_stream(m_format, nullptr);
  if (!stream) throw std::bad_alloc();
  return *stream;
}

void Destination::begin() {
  int const result = avformat_write_header(m_format, nullptr);
  if (result < 0) failToWrite(result);
}

void Destination::write(AVPacket& packet, AVStream const& stream, AVRational timeBase) {
  packet.stream_index = stream.index;
  packet.pos = -1;
  av_packet_rescale_ts(&packet, timeBase, stream.time_base);
  int const result = av_interleaved_write_frame(m_format, &packet);
  if (result < 0) failToWrite(result);
}

void Destination::end() {
  int const result = av_write_trailer(m_format);
  if (result < 0) failToWrite(result);
  avio_flush(m_format->pb);
  if (m_format->pb->error < 0) failToWrite(m_format->pb->error);
}

void Destination::failToWrite(int code) const {
  if (m_error != 0) throw VideoError(std::string("cannot be written: ") + std::strerror(m_error));
  fail("a " + m_suffix + " file cannot be written like that", code);
}

int Destination::writeBytes(void* self, uint8_t* bytes, int count) {
  auto& own = *static_cast<Destination*>(self);
  for (int done = 0; done < count;) {
    ssize_t const written = ::write(own.m_file, bytes + done, static_cast<size_t>(count - done));
    if (written < 0 && errno == EINTR) continue;
    if (written < 0) {
      own.m_error = errno;
      return AVERROR(own.m_error);
    }
    done += static_cast<int>(written);
  }
  return count;
}

int64_t Destination::seek(void* self, int64_t offset, int whence) {
  auto const& own = *static_cast<Destination*>(self);
  if (whence & AVSEEK_SIZE) {
    struct stat status {};
    return ::fstat(own.m_file, &status) == 0 ? status.st_size : AVERROR(errno);
  }
  off_t const place = ::lseek(own.m_file, offset, whence & ~AVSEEK_FORCE);
  return place >= 0 ? place : AVERROR(errno);
}

}  // namespace talix_video
