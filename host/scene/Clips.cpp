#include "host/scene/Clips.h"

#include "host/scene/ChangeSetBuilder.h"
#include "host/scene/Database.h"
#include "host/scene/HTimeManager.h"

H_DEFINE_ABSTRACT_CLASS(NLEClip);
H_DEFINE_CLASS(Clip);
H_DEFINE_CLASS(BlendClip);

void NLEClip::setUp() {
  Module::setUp();
  m_weight = static_cast<FloatController*>(addChannel("Weight", DataSource::FloatProperty));
  m_weight->setConstValue(1, false);
}

bool NLEClip::isActive() const { return getDatabase()->getActiveClip() == this; }

NLEClip* NLEClip::getNext() const { return getDatabase()->getClipAfter(this); }

// A blend's values hang on the weights of its sources.
void NLEClip::dataChanged(Controller const*) { getDatabase()->forgetWorldCache(); }

struct NLEClip::LocksChange : UndoChange {
  explicit LocksChange(NLEClip& concerned)
      : UndoChange(&concerned), clip(concerned), locks(concerned.m_layerLocks) {}
  void swap() override { clip.m_layerLocks.swap(locks); }
  bool isVoid() const override { return locks == clip.m_layerLocks; }
  int64 memoryUse() const override { return static_cast<int64>(sizeof *this + locks.capacity() / 8); }

  void tell(ChangeSetBuilder& changes) const override {
    changes.tell(SceneChange::Kind::attribute, &clip, "LayerLocks", textOf(Attribute::Value(locks)),
                 textOf(Attribute::Value(clip.m_layerLocks)));
  }

  NLEClip& clip;
  std::vector<bool> locks;
};

void NLEClip::storeLayerLocks(std::vector<bool> locks) {
  if (isRecorded()) journal().add(std::make_unique<LocksChange>(*this));
  m_layerLocks = std::move(locks);
}

int NLEClip::addLayer() {
  std::vector<bool> locks = m_layerLocks;
  locks.push_back(false);
  storeLayerLocks(std::move(locks));
  return getNumLayers() - 1;
}

bool NLEClip::isLayerLocked(int layer) const { return itemAt(m_layerLocks, layer); }

void NLEClip::setLayerLocked(int layer, bool locked) {
  if (layer < 0 || layer >= getNumLayers()) return;
  std::vector<bool> locks = m_layerLocks;
  locks[static_cast<size_t>(layer)] = locked;
  storeLayerLocks(std::move(locks));
}

int64 NLEClip::getFramePeriod() const { return getDatabase()->getTimeManager()->getTicksPerFrame(); }

struct Clip::FileTimeChange : UndoChange {
  explicit FileTimeChange(Clip& concerned)
      : UndoChange(&concerned), clip(concerned), time(concerned.m_fileTime) {}
  void swap() override { std::swap(clip.m_fileTime, time); }
  bool isVoid() const override { return time == clip.m_fileTime; }
  int64 memoryUse() const override { return sizeof *this; }

  void tell(ChangeSetBuilder& changes) const override {
    auto const text = [](FileTime const& of) {
      return textOf(Attribute::Value(of.rate)) + " " + std::to_string(of.firstFrame) + " " +
             std::to_string(of.frameCount) + " " + textOf(Attribute::Value(of.sampleRate));
    };
    changes.tell(SceneChange::Kind::attribute, &clip, "FileTime", text(time), text(clip.m_fileTime));
  }

  Clip& clip;
  FileTime time;
};

void Clip::setFileTime(FileTime const& time) {
  if (isRecorded()) journal().add(std::make_unique<FileTimeChange>(*this));
  m_fileTime = time;
}

int64 Clip::getFramePeriod() const {
  return m_fileTime.rate > 0 ? ticksPerFrameAt(m_fileTime.rate) : NLEClip::getFramePeriod();
}

void Clip::setUp() {
  NLEClip::setUp();
  m_smpteOffset = addBuiltIn<TimeAttribute>("SmpteOffset");
}

Clip* Clip::createInstance() {
  auto* clip = new Clip;
  clip->setUp();
  return clip;
}

void Clip::setSmpteOffset(int64 ticks) { m_smpteOffset->setValue(ticks, true, true, true, true); }

void BlendClip::setUp() {
  NLEClip::setUp();
  m_sources = addBuiltIn<MultiModAttribute>("Sources");
  setReaction(m_sources, [](Module& module, Attribute&) { module.getDatabase()->forgetWorldCache(); });
}
