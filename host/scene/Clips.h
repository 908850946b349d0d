// Clips: takes of motion. At most 31 in a scene; at most one is active.
#pragma once

#include "host/scene/Module.h"

class NLEClip : public Module {
  H_DECLARE_CLASS(NLEClip, Module)

 public:
  static constexpr int kMaximum = 31;  // in a scene

  bool isActive() const;
  NLEClip* getNext()
      const;  // in the scene's list of clips, which Database::getHeadClip starts; null at the end

  // Layers count from 0; every clip has at least one. Channels hold keys by layer.
  int getNumLayers() const { return static_cast<int>(m_layerLocks.size()); }
  int addLayer();  // returns its number
  bool isLayerLocked(int layer) const;
  void setLayerLocked(int layer, bool locked);

  // Whether channels can hold keys in this clip.
  virtual bool holdsKeys() const { return true; }
  // Ticks from frame to frame, by which its gaps go and it is saved: the scene's.
  virtual int64 getFramePeriod() const;
  FloatController* getWeightChannel() const { return m_weight; }

 protected:
  void setUp() override;
  void dataChanged(Controller const*) override;

 private:
  friend class Database;

  void storeLayerLocks(std::vector<bool> locks);  // mutator
  struct LocksChange;

  FloatController* m_weight = nullptr;
  std::vector<bool> m_layerLocks{false};
  uint32 m_clipSlot = kNoSlot;
};

class Clip : public NLEClip {
  H_DECLARE_CLASS(Clip, NLEClip)

 public:
  // One that is not in the scene yet.
  static Clip* createInstance();

  // Of the file that it was read from. Its frames lie at the multiples of one frame's time.
  struct FileTime {
    double rate = 0;        // frames a second; 0: the clip is from no file
    int64 firstFrame = 0;   // in the file's numbers
    int64 frameCount = 0;   // those without data included
    double sampleRate = 0;  // of devices, samples a second; 0: none

    bool operator==(FileTime const&) const = default;
  };
  FileTime const& getFileTime() const { return m_fileTime; }
  void setFileTime(FileTime const& time);
  // The file's, else the scene's.
  int64 getFramePeriod() const override;

  // Timecode offset, in ticks.
  int64 getSmpteOffset() const { return m_smpteOffset->getTime(); }
  void setSmpteOffset(int64 ticks);

 protected:
  void setUp() override;

 private:
  struct FileTimeChange;

  TimeAttribute* m_smpteOffset = nullptr;
  FileTime m_fileTime;
};

// Mixes its source clips ("Sources") by their "Weight" channels; holds no keys of its own.
class BlendClip : public NLEClip {
  H_DECLARE_CLASS(BlendClip, NLEClip)

 public:
  bool holdsKeys() const override { return false; }
  MultiModAttribute* getSources() const { return m_sources; }

 protected:
  void setUp() override;

 private:
  MultiModAttribute* m_sources = nullptr;
};
