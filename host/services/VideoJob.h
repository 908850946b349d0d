// What the engine asks of libTalixVideo.so, which alone knows how videos are read and written. The engine
// loads it when a video is first transcoded, and knows it by one entry point.
#pragma once

#include <string>

namespace Nex {

// How the timecode is drawn into each picture.
struct IBurnInTimecodeSettings {
  int position = 0;  // 0 top left, 1 top centre, 2 top right, 3 to 5 the same at the bottom
  int size = 2;      // 0 (smallest) to 4
  int marginX = 25;  // pixels to the picture's edge
  int marginY = 25;
  int box = 1;  // 0: no box behind the text
};

}  // namespace Nex

// A pinhole with the distortion of Brown and Conrady. Lengths in pixels from the picture's left and upper
// edge.
struct VideoLens {
  double fx = 0, fy = 0, cx = 0, cy = 0;
  double k1 = 0, k2 = 0, k3 = 0, p1 = 0, p2 = 0;
};

struct VideoJob {
  char const* source = "";
  char const* destination = "";  // tells the container by its suffix
  int file = -1;                 // what is written, from its begin; stays open
  char const* payload = "";      // ENCODER or ENCODER:PRESET; empty: chosen by the container
  int quality = 85;              // 1 to 100
  bool removeAudio = false;
  Nex::IBurnInTimecodeSettings const* burnIn = nullptr;  // null: none
  float const* saturation = nullptr;                     // null: as it is
  float const* gamma = nullptr;
  VideoLens const* lens = nullptr;  // null: as it is
  bool undistort = false;
  bool centre = false;  // moves the lens' principal point into the picture's centre
  // Told how far it is, in thousandths. False: stop.
  bool (*goOn)(int done) = nullptr;
  void (*warn)(char const* text) = nullptr;
};

enum class VideoOutcome : int { done, failed, cancelled };

// The entry point. `problem` says, in one line, why it failed.
using TranscodeVideo = VideoOutcome(VideoJob const& job, std::string& problem);
inline constexpr char const kTranscodeVideo[] = "talixTranscodeVideo";
