// A trajectory: a point measured over time. Labelled when a character is among its ancestors.
#pragma once

#include "host/scene/Node.h"

class Marker : public Node {
  H_DECLARE_CLASS(Marker, Node)

 public:
  // How the data at a time came about, as the integer channel "FillType" keys it; never whether there is
  // data.
  enum EFillType : int { Recorded = 0, Filled = 1, EditedByHand = 2, Resampled = 3 };

  // A marker that is not in the scene yet: Database::addToScene puts it there, or the caller deletes it.
  static Marker* createInstance();

  bool isUnlabeled() const;
  // Keys the fill type at a time, where keys can be edited. notify does nothing.
  void setFillType(int64 const& time, EFillType const& type, bool notify);
  EFillType getFillType(int64 time) const;
  // Whether every component of the position has data at a time in the active clip: a key, or a bridge that
  // passes over the time. True without an active clip that holds keys, where the default position is shown.
  bool isSeenAt(int64 time) const;

  // Reads true where the marker is not seen, elsewhere what its keys say.
  BoolController* getOccludedChannel() const { return m_occluded; }
  FloatController* getResidualChannel() const { return m_residual; }

 protected:
  void setUp() override;

 private:
  friend class Selection;

  BoolController* m_occluded = nullptr;
  IntController* m_fillType = nullptr;
  FloatController* m_residual = nullptr;
  uint32 m_selectedMarkerSlot = kNoSlot;
};
