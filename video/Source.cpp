#include "video/Source.h"

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <string_view>
#include <sys/stat.h>

namespace talix_video {

namespace {

// Their files name other files, or are names of others.
bool isPlaylist(std::string_view format) {
  for (std::string_view const name : {"concat", "hls", "dash", "imf", "image2", "sdp", "ffmetadata", "lrc"})
    if (format == name) return true;
  return false;
}

}  // namespace

Source::Source(std::string const& path) {
  try {
    open(path);
    findVideo();
  } catch (...) {
    avformat_close_input(&m_format);
    avio_closep(&m_io);
    throw;
  }
}

Source::~Source() {
  avformat_close_input(&m_format);
  avio_closep(&m_io);
}

void Source::open(std::string const& path) {
  struct stat status {};
  if (::stat(path.c_str(), &status) != 0) throw VideoError(std::strerror(errno));
  if (!S_ISREG(status.st_mode)) throw VideoError("not a file");
  if (status.st_size == 0) throw VideoError("the file is empty");
  AVDictionary* options = nullptr;
  av_dict_set(&options, "protocol_whitelist", "file", 0);
  // With the protocol before it no part of the name is taken for one.
  int const opened = avio_open2(&m_io, ("file:" + path).c_str(), AVIO_FLAG_READ, nullptr, &options);
  av_dict_free(&options);
  if (opened < 0) fail("cannot be read", opened);
  AVInputFormat const* format = nullptr;
  // By the content alone: a name says little, and may be taken for a pattern of names.
  check(av_probe_input_buffer2(m_io, &format, "", nullptr, 0, 0), "not a video");
  if (isPlaylist(format->name) || format->flags & AVFMT_NOFILE)
    throw VideoError("not a video: a list of other files (" + std::string(format->name) + ")");
  m_format = avformat_alloc_context();
  if (!m_format) throw std::bad_alloc();
  m_format->pb = m_io;
  m_format->io_open = &refuseOtherFiles;
  av_opt_set(m_format, "protocol_whitelist", "file", 0);
  check(avformat_open_input(&m_format, "", format, nullptr), "not a whole video");

  // Before FFmpeg makes up what the header does not say.
  m_promised = std::max<int64_t>(m_format->duration, 0);
  for (unsigned i = 0; i < m_format->nb_streams; ++i) {
    AVStream const& stream = *m_format->streams[i];
    Track& track = m_tracks[static_cast<int>(i)];
    if (stream.duration > 0) track.promised = stream.duration;
    track.frames = stream.nb_frames;
    // Here the reader has cut the length already to what is there; the unit of time is a frame.
    if (std::string_view(format->name) == "avi") track.promised = std::max(track.promised, track.frames);
  }
  check(avformat_find_stream_info(m_format, nullptr), "not a whole video");
}

void Source::findVideo() {
  m_video = av_find_best_stream(m_format, AVMEDIA_TYPE_VIDEO, -1, -1, nullptr, 0);
  // Pictures that belong to sound, such as covers, are none.
  if (m_video < 0 || getVideo().disposition & AV_DISPOSITION_ATTACHED_PIC)
    throw VideoError("there is no video in the file");
  if (getVideo().codecpar->width <= 0 || getVideo().codecpar->height <= 0)
    throw VideoError("not a whole video: its pictures have no size");
  AVRational const rate = av_guess_frame_rate(m_format, &getVideo(), nullptr);
  if (rate.num > 0 && rate.den > 0) m_rate = rate;
  m_tracks[m_video];  // some headers do not name it
}

std::optional<std::string> Source::getTimecode() const {
  auto const find = [](AVDictionary const* among) { return av_dict_get(among, "timecode", nullptr, 0); };
  AVDictionaryEntry const* found = find(getVideo().metadata);
  for (unsigned i = 0; i < m_format->nb_streams && !found; ++i) found = find(m_format->streams[i]->metadata);
  if (!found) found = find(m_format->metadata);
  if (!found) return std::nullopt;
  return found->value;
}

AVRational Source::getTimecodeRate() const {
  for (unsigned i = 0; i < m_format->nb_streams; ++i) {
    AVStream const& stream = *m_format->streams[i];
    bool const counts = stream.codecpar->codec_tag == MKTAG('t', 'm', 'c', 'd');
    if (counts && stream.avg_frame_rate.num > 0 && stream.avg_frame_rate.den > 0)
      return stream.avg_frame_rate;
  }
  return m_rate;
}

int64_t Source::getStart(AVStream const& stream) const {
  if (m_format->start_time == AV_NOPTS_VALUE) return 0;
  return av_rescale_q(m_format->start_time, AV_TIME_BASE_Q, stream.time_base);
}

bool Source::read(AVPacket& packet) {
  int const result = av_read_frame(m_format, &packet);
  if (result == AVERROR_EOF) {
    if (m_io->error < 0) fail("cannot be read", m_io->error);
    checkEnd();
    return false;
  }
  check(result, "cannot be read to its end");
  Track& track = m_tracks[packet.stream_index];
  ++track.read;
  track.damaged = packet.flags & AV_PKT_FLAG_CORRUPT;
  int64_t const from = packet.pts != AV_NOPTS_VALUE ? packet.pts : packet.dts;
  if (from != AV_NOPTS_VALUE) track.end = std::max(track.end, from + std::max<int64_t>(packet.duration, 0));
  return true;
}

void Source::checkEnd() const {
  VideoError const cut("the file ends before its video does");
  Track const& video = m_tracks.at(m_video);
  if (video.damaged || video.read == 0) throw cut;
  if (video.frames > 0 && video.read >= video.frames) return;
  // Two frames of grace, since headers round.
  double const grace = 2 * av_q2d(av_inv_q(m_rate));
  auto const startOf = [](int64_t start) { return start == AV_NOPTS_VALUE ? 0 : start; };
  if (video.promised != AV_NOPTS_VALUE) {
    if (video.end == AV_NOPTS_VALUE) return;
    int64_t const missing = startOf(getVideo().start_time) + video.promised - video.end;
    if (static_cast<double>(missing) * av_q2d(getVideo().time_base) >= grace) throw cut;
  } else if (m_promised > 0) {
    double end = 0;
    for (auto const& [index, track] : m_tracks)
      if (track.end != AV_NOPTS_VALUE)
        end = std::max(
            end, static_cast<double>(track.end) * av_q2d(m_format->streams[index]->time_base) * AV_TIME_BASE);
    double const promised = static_cast<double>(startOf(m_format->start_time) + m_promised);
    if ((promised - end) / AV_TIME_BASE >= grace) throw cut;
  }
}

int Source::getDone() const {
  Track const& video = m_tracks.at(m_video);
  if (m_format->duration <= 0 || video.end == AV_NOPTS_VALUE) return 0;
  int64_t const at = av_rescale_q(video.end - getStart(getVideo()), getVideo().time_base, AV_TIME_BASE_Q);
  return static_cast<int>(std::clamp<int64_t>(1000 * at / m_format->duration, 0, 1000));
}

}  // namespace talix_video
