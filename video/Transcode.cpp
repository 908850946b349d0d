// The library's entry point.
#include <map>

#include "host/services/VideoJob.h"
#include "video/AudioTrack.h"
#include "video/VideoTrack.h"

namespace talix_video {

namespace {

// What belongs to the file rather than to its former container.
void copyMetadata(Source const& source, Destination const& destination, VideoJob const& job) {
  AVDictionary*& to = destination.getFormat().metadata;
  check(av_dict_copy(&to, source.getFormat().metadata, 0), "the metadata");
  for (char const* own : {"major_brand", "minor_version", "compatible_brands", "encoder"})
    av_dict_set(&to, own, nullptr, 0);
  auto const timecode = source.getTimecode();
  if (!timecode) return;
  // Containers keep it by stream or by file. They refuse to be written with one that they cannot count.
  AVTimecode code;
  bool const counts =
      av_timecode_init_from_string(&code, source.getTimecodeRate(), timecode->c_str(), nullptr) >= 0;
  if (!counts) job.warn("The file's timecode does not go with its rate and is not kept.");
  char const* kept = counts ? timecode->c_str() : nullptr;
  av_dict_set(&to, "timecode", kept, 0);
  for (unsigned i = 0; i < destination.getFormat().nb_streams; ++i) {
    AVStream& stream = *destination.getFormat().streams[i];
    bool const video = stream.codecpar->codec_type == AVMEDIA_TYPE_VIDEO;
    av_dict_set(&stream.metadata, "timecode", video ? kept : nullptr, 0);
    // Containers count it by that.
    if (video && kept) stream.avg_frame_rate = source.getTimecodeRate();
  }
}

void transcode(VideoJob const& job) {
  Source source(job.source);
  Destination destination(job.destination, job.file);
  VideoTrack video(job, source, destination);
  std::map<int, AudioTrack> sounds;
  for (unsigned i = 0; i < source.getFormat().nb_streams && !job.removeAudio; ++i) {
    AVStream const& stream = *source.getFormat().streams[i];
    if (stream.codecpar->codec_type != AVMEDIA_TYPE_AUDIO) continue;
    if (!AudioTrack::canBeIn(destination)) {
      job.warn(("A " + destination.getSuffix() + " file holds no sound.").c_str());
      break;
    }
    sounds.try_emplace(stream.index, source, stream, destination);
  }
  copyMetadata(source, destination, job);
  destination.begin();
  PacketPtr packet = newPacket();
  while (source.read(*packet)) {
    if (!job.goOn(source.getDone())) throw Cancelled();
    if (packet->stream_index == source.getVideo().index)
      video.take(*packet);
    else if (auto const sound = sounds.find(packet->stream_index); sound != sounds.end())
      sound->second.take(*packet);
    av_packet_unref(packet.get());
  }
  video.finish();
  for (auto& [index, sound] : sounds) sound.finish();
  if (!job.goOn(1000)) throw Cancelled();
  destination.end();
}

}  // namespace

}  // namespace talix_video

extern "C" __attribute__((visibility("default"))) VideoOutcome talixTranscodeVideo(VideoJob const& job,
                                                                                   std::string& problem);

VideoOutcome talixTranscodeVideo(VideoJob const& job, std::string& problem) {
  talix_video::keepLogQuiet();
  try {
    talix_video::transcode(job);
    return VideoOutcome::done;
  } catch (talix_video::Cancelled const&) {
    return VideoOutcome::cancelled;
  } catch (talix_video::VideoError const& error) {
    problem = std::string(job.source) + ": " + error.what();
  } catch (std::bad_alloc const&) {
    problem = std::string(job.source) + ": not enough memory";
  } catch (std::exception const& error) {
    problem = std::string(job.source) + ": cannot be transcoded: " + error.what();
  }
  return VideoOutcome::failed;
}
