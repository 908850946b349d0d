// A trajectory: a point measured over time. Labelled when a character is among its ancestors.
#pragma once

#include "host/scene/Node.h"

class Marker : public Node {
  H_DECLARE_CLASS(Marker, Node)

 public:
  // How the data at a time came about, as the integer channel "FillType" keys it.
  enum EFillType : int { Recorded = 0, Filled = 1, EditedByHand = 2, Resampled = 3, Reduced = 4 };

  // A marker that is not in the scene yet: Database::addToScene puts it there, or the caller deletes it.
  static Marker* createInstance();

  bool isUnlabeled() const;
  // Keys the fill type at a time, where keys can be edited; an attribute of that name is in the way of it.
  // notify does nothing.
  void setFillType(int64 const& time, EFillType const& type, bool notify);
  EFillType getFillType(int64 time) const;
  // Whether the frames behind a time, up to the next key, have data although keys are missing there, because
  // reduction took these out: the fill type that was keyed last holds there.
  bool isReducedBehind(int64 time) const;

  BoolController* getOccludedChannel() const { return m_occluded; }
  FloatController* getResidualChannel() const { return m_residual; }

 protected:
  void setUp() override;

 private:
  friend class Selection;

  BoolController* m_occluded = nullptr;
  FloatController* m_residual = nullptr;
  uint32 m_selectedMarkerSlot = kNoSlot;
};
