#include "video/Av.h"

#include <cstdarg>
#include <cstdio>
#include <mutex>

namespace talix_video {

namespace {

// Decoders log from threads of their own.
std::mutex s_mutex;
char s_lastError[512];

void keepError(void* from, int level, char const* format, va_list values) {
  if (level > AV_LOG_ERROR) return;
  char line[512];
  int prefix = 0;
  av_log_format_line2(from, level, format, values, line, sizeof line, &prefix);
  std::lock_guard const lock(s_mutex);
  std::snprintf(s_lastError, sizeof s_lastError, "%s", line);
}

std::string takeLastError() {
  std::lock_guard const lock(s_mutex);
  std::string text = s_lastError;
  s_lastError[0] = 0;
  while (!text.empty() && text.back() == '\n') text.pop_back();
  // Addresses differ from run to run.
  if (size_t const at = text.find(" @ 0x"), end = text.find(']'); at < end && end != std::string::npos)
    text.erase(at, end - at);
  // It may quote what a damaged file holds.
  for (char& c : text)
    if (c < ' ' || c > '~') c = c == '\n' ? ' ' : '?';
  return text;
}

}  // namespace

void keepLogQuiet() {
  av_log_set_callback(&keepError);
  takeLastError();
}

void fail(std::string const& what, int code) {
  if (code == AVERROR(ENOMEM)) throw std::bad_alloc();
  std::string reason = takeLastError();
  if (reason.empty()) {
    char text[AV_ERROR_MAX_STRING_SIZE] = "";
    av_strerror(code, text, sizeof text);
    reason = text;
  }
  throw VideoError(what + ": " + reason);
}

int refuseOtherFiles(AVFormatContext*, AVIOContext**, char const*, int, AVDictionary**) {
  return AVERROR(EPERM);
}

CodecPtr openDecoder(AVStream const& stream) {
  AVCodec const* codec = avcodec_find_decoder(stream.codecpar->codec_id);
  if (!codec)
    throw VideoError(std::string("nothing here decodes ") + avcodec_get_name(stream.codecpar->codec_id));
  auto decoder = owned<CodecPtr>(avcodec_alloc_context3(codec));
  check(avcodec_parameters_to_context(decoder.get(), stream.codecpar), "bad parameters");
  decoder->pkt_timebase = stream.time_base;
  decoder->thread_count = 0;  // as many as there are cores
  check(avcodec_open2(decoder.get(), codec, nullptr), "the decoder does not start");
  return decoder;
}

}  // namespace talix_video
