// One recorded take as a file holds it, before it is put into a scene: what all readers make and "talix info"
// shows. Key data lies in KeyTracks, so moving it into the scene copies nothing. What is said about the data
// stands in the Info types, which takes that are written have too (TakeSource.h).
//
// Lengths are millimetres and angles radians, whatever the file says; fileUnit names the file's own length
// unit. Positions are in the file's own axes. Frame numbers are the file's own.
#pragma once

#include <string>
#include <vector>

#include "host/keys/KeyTrack.h"
#include "host/math/Vec3.h"
#include "host/time/Ticks.h"

namespace talix {

enum class Axis : unsigned char { X, Y, Z };

// A line for the user about what was converted, assumed or mended.
struct TakeNote {
  enum class Level : unsigned char { Info, Warning } level;
  std::string text;
};

struct TakePointInfo {
  std::string subject;  // empty: none given by the file
  std::string label;    // without the subject; empty for a point without a real label
  std::string description;
};
struct TakePoint : TakePointInfo {
  KeyTrack positions{KeyTrack::Shape::Vector};  // no key at a frame where the point was not seen
  KeyTrack residuals{KeyTrack::Shape::Scalar};  // mm, a key where positions has one; empty: none recorded
  std::vector<unsigned char> cameras;           // camera mask by frame; empty: none recorded
};

// A channel that is no position: an angle, force, moment, power or scalar computed with the take. Unscaled.
struct ModelOutputInfo {
  std::string name;
  std::string unit;
  std::string kind;  // "ANGLES", "FORCES", "MOMENTS", "POWERS", "SCALARS", ...
};
struct ModelOutput : ModelOutputInfo {
  KeyTrack values{KeyTrack::Shape::Vector};
};

struct TakeAnalogInfo {
  std::string name;
  std::string unit;
  std::string description;
  double scale = 1;  // file value to unit, as the file had it
  double offset = 0;
};
struct TakeAnalogChannel : TakeAnalogInfo {
  KeyTrack samples{KeyTrack::Shape::Scalar};  // in the unit; keys at the analog rate
};

struct TakeJointInfo {
  std::string name;
  int parent = -1;  // index into joints, always smaller than the own; -1: a root
  bool endSite = false;
  Vec3 offset;                        // to the parent, mm
  int rotationOrder = 0;              // 0 to 5: XYZ XZY YXZ YZX ZXY ZYX, the first axis is applied first
  std::vector<std::string> channels;  // the file's, in its order
};
struct TakeJoint : TakeJointInfo {
  KeyTrack translations{
      KeyTrack::Shape::Vector};  // mm, the file's channel values (with the offset); may be empty
  KeyTrack rotations{KeyTrack::Shape::Rotation};  // may be empty
};

struct TakeEvent {
  std::string label;
  std::string context;  // "Left", "Right", "General", ...
  std::string subject;
  std::string description;
  double seconds = 0;  // from the start of the recording, as the file gives it
};

struct TakeInfo {
  std::string format;  // "C3D", "BVH", "TRC"
  std::string name;    // the file's name without folder and suffix
  double rate = 120;   // frames a second
  int64 firstFrame = 0;
  int64 frameCount = 0;
  std::string fileUnit = "mm";   // "mm", "cm", "m", "in", "ft" or the file's own word
  double unitInMillimetres = 1;  // how many mm one file unit is
  bool unitAssumed = false;      // the file does not say
  Axis up = Axis::Z;
  bool upAssumed = false;
  double analogRate = 0;  // samples a second, 0: no analog data
  std::vector<TakeEvent> events;
};

struct Take : TakeInfo {
  std::vector<TakePoint> points;
  std::vector<ModelOutput> outputs;
  std::vector<TakeAnalogChannel> analog;
  std::vector<TakeJoint> joints;  // parents before children, siblings in file order
  std::string variant;            // what a person may want to know: "Intel, integer" ...
  std::vector<TakeNote> notes;
};

}  // namespace talix
