// The video file that is written.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "video/Av.h"

namespace talix_video {

class Destination {
 public:
  // The name tells the container; the content goes to the descriptor.
  Destination(std::string const& name, int file);
  ~Destination();
  Destination(Destination const&) = delete;
  Destination& operator=(Destination const&) = delete;

  AVFormatContext& getFormat() const { return *m_format; }
  AVOutputFormat const& getKind() const { return *m_format->oformat; }
  std::string const& getSuffix() const { return m_suffix; }
  // Whether its pictures may stand at any time; else they come at their rate.
  bool hasTimes() const;
  bool canHold(AVCodecID codec) const;

  AVStream& addStream();
  // Once all streams are there.
  void begin();
  // In the units given, which may differ from the stream's.
  void write(AVPacket& packet, AVStream const& stream, AVRational timeBase);
  void end();

 private:
  static int writeBytes(void* self, uint8_t* bytes, int count);
  static int64_t seek(void* self, int64_t offset, int whence);
  void release();
  [[noreturn]] void failToWrite(int code) const;

  AVFormatContext* m_format = nullptr;
  std::string m_suffix;
  int m_file;
  int m_error = 0;  // of the system
};

}  // namespace talix_video
