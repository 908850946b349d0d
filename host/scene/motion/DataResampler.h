// The scene at another frame rate.
#pragma once

#include "host/time/HFrameRate.h"

class DataResampler {
 public:
  // Gives the keys of all modules (selected: of the selected ones) in all clips keys at the frames of a rate,
  // as KeyResampling.h says, and the scene that rate and timecode standard. Clips that were read from a file
  // go to the rate with it; ranges keep the frames that lie inside them. respectGaps: data stays missing
  // where it was; else curves go through their gaps. Markers without a subject are left out unless
  // includeUnlabeled.
  //
  // What is left out keeps its keys where they are and has data between them as before. Analog channels keep
  // their rate where a whole number of samples fits a new frame; else they go to the nearest rate that does,
  // with a warning. Locked clips, layers, modules and channels keep their keys, with a warning.
  //
  // False when the user has cancelled; nothing has changed then.
  static bool resample(HFrameRate rate, bool selected, bool respectGaps, bool includeUnlabeled);
};
