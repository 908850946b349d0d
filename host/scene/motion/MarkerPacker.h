// Fewer markers for the same trajectories, and one marker for each of them.
//
// A trajectory is what one marker saw: runs of frames with data, in each clip. Packing joins the trajectories
// of several markers in one where two rules allow it, so that what was joined can still be told apart, by eye
// and by unpack:
//
// - Between a run and the next one in the same marker at least the minimum gap of frames is without data (1
//   unless set; 0 lets runs follow each other without a gap, and then unpack cannot part them again).
// - The position where a run ends and the one where the next begins are at least the minimum distance apart
//   (0 mm unless set). A run that begins near where another has just ended may well be the same marker seen
//   again. Joined without this rule, such pieces look like one marker with a gap, which filling would bridge;
//   with it they stay apart until somebody has decided.
//
// Only markers with one parent and pre-transform are joined, and none that has something below it, is locked,
// or has keys in an upper layer or on rotation or scale.
#pragma once

#include "host/base/TSimpleArray.h"
#include "host/scene/Marker.h"

class MarkerPacker {
 public:
  MarkerPacker() = default;
  ~MarkerPacker() = default;

  void setMinimumGapSize(int frames) { m_minimumGap = frames; }
  void setMimimumDistance(double millimetres) { m_minimumDistance = millimetres; }
  void setMarkerList(TSimpleArray<Marker*> const& markers) { m_markers = markers; }

  // Joins the markers of the list in as few as the rules allow; target (null: none): in that one alone, as
  // many as fit. Of the markers that are joined the first in time stays; the others leave the scene. Returns
  // how many left. A marker that cannot be joined for another reason than the rules is a warning.
  //
  // The number is the least possible where each trajectory is one run in one clip: by matching each run with
  // the one before it, from the earliest on; with a minimum distance as far as a bound on the work allows.
  // Trajectories of several runs go where they fit first.
  int pack(Marker* target);

  // Gives each run of frames with data in the active clip a marker of its own; the first run stays. Where the
  // clip has several layers, each marker gets the upper ones whole. Returns how many markers were split.
  int unpack();

 private:
  int m_minimumGap = 1;
  double m_minimumDistance = 0;
  TSimpleArray<Marker*> m_markers;
};
