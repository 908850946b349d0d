// A video file that is read.
#pragma once

#include <map>
#include <optional>
#include <string>

#include "video/Av.h"

namespace talix_video {

class Source {
 public:
  // Throws for what is no file with a video in it. Nothing but the file itself is opened, whatever it says.
  explicit Source(std::string const& path);
  ~Source();
  Source(Source const&) = delete;
  Source& operator=(Source const&) = delete;

  AVFormatContext& getFormat() const { return *m_format; }
  AVStream& getVideo() const { return *m_format->streams[m_video]; }
  AVRational getRate() const { return m_rate; }  // frames a second, above 0
  // The file's own one, of its first picture.
  std::optional<std::string> getTimecode() const;
  AVRational getTimecodeRate() const;  // in which it counts
  // The least time of any stream, in a stream's units.
  int64_t getStart(AVStream const& stream) const;

  // The next packet. False at the end; throws when the file ends before its header says so.
  bool read(AVPacket& packet);
  // How far it is, in thousandths.
  int getDone() const;

 private:
  struct Track {
    int64_t promised = AV_NOPTS_VALUE;  // its end as the header has it
    int64_t frames = 0;                 // as the header has them; 0: unknown
    int64_t read = 0, end = AV_NOPTS_VALUE;
    bool damaged = false;  // the last packet
  };
  void open(std::string const& path);
  void findVideo();
  void checkEnd() const;

  AVFormatContext* m_format = nullptr;
  AVIOContext* m_io = nullptr;
  int m_video = -1;
  AVRational m_rate{25, 1};
  int64_t m_promised = 0;  // length of the file by its header, in microseconds; 0: unknown
  std::map<int, Track> m_tracks;
};

}  // namespace talix_video
