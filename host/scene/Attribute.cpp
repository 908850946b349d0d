#include "host/scene/Attribute.h"

#include <algorithm>
#include <cmath>

#include "host/base/ItemAt.h"
#include "host/scene/ChangeSetBuilder.h"
#include "host/scene/Database.h"
#include "host/scene/HTimeManager.h"
#include "host/scene/UndoJournal.h"

H_DEFINE_ABSTRACT_CLASS(Attribute);
H_DEFINE_CLASS(IntAttribute);
H_DEFINE_CLASS(TemperatureAttribute);
H_DEFINE_CLASS(EnumAttribute);
H_DEFINE_CLASS(FloatAttribute);
H_DEFINE_CLASS(StringAttribute);
H_DEFINE_CLASS(NameAttribute);
H_DEFINE_CLASS(MultiStringAttribute);
H_DEFINE_CLASS(BoolAttribute);
H_DEFINE_CLASS(VectorAttribute);
H_DEFINE_CLASS(BitFieldAttribute);
H_DEFINE_CLASS(RotationAttribute);
H_DEFINE_CLASS(TimeAttribute);
H_DEFINE_CLASS(ColorAttribute);
H_DEFINE_CLASS(EventAttribute);
H_DEFINE_CLASS(NoneAttribute);
H_DEFINE_CLASS(ModAttribute);
H_DEFINE_CLASS(MatrixAttribute);
H_DEFINE_CLASS(MultiModAttribute);

namespace {

std::unique_ptr<Attribute> makeKind(Attribute::Type type, Attribute::Labels labels) {
  switch (type) {
    case Attribute::Integer:
      return std::make_unique<IntAttribute>();
    case Attribute::Enumeration:
      return std::make_unique<EnumAttribute>(std::move(labels));
    case Attribute::Float:
      return std::make_unique<FloatAttribute>();
    case Attribute::String:
      return std::make_unique<StringAttribute>();
    case Attribute::MultiString:
      return std::make_unique<MultiStringAttribute>();
    case Attribute::Boolean:
      return std::make_unique<BoolAttribute>();
    case Attribute::Vector:
      return std::make_unique<VectorAttribute>();
    case Attribute::BitField:
      return std::make_unique<BitFieldAttribute>(std::move(labels));
    case Attribute::Rotation:
      return std::make_unique<RotationAttribute>();
    case Attribute::Time:
      return std::make_unique<TimeAttribute>();
    case Attribute::Color:
      return std::make_unique<ColorAttribute>(Database::getDefaultModColor());
    case Attribute::Event:
      return std::make_unique<EventAttribute>();
    case Attribute::ModuleReference:
      return std::make_unique<ModAttribute>();
    case Attribute::NoKind:
      return std::make_unique<NoneAttribute>();
    case Attribute::MatrixKind:
      return std::make_unique<MatrixAttribute>();
    case Attribute::MultiModule:
      return std::make_unique<MultiModAttribute>();
    case Attribute::Temperature:
      return std::make_unique<TemperatureAttribute>();
  }
  return nullptr;
}

}  // namespace

std::unique_ptr<Attribute> Attribute::create(Type type, HString const& name, Labels labels) {
  std::unique_ptr<Attribute> attribute = makeKind(type, std::move(labels));
  attribute->m_name = name;
  return attribute;
}

Attribute::~Attribute() { releaseFrom(m_value); }

void Attribute::takeAsDefault() {
  // The default of a reference names nothing, so that no default outlives its module.
  if (!std::holds_alternative<Module*>(m_value) && !std::holds_alternative<Modules>(m_value))
    m_default = m_value;
}

void Attribute::referTo(Value const& value) {
  if (auto* module = std::get_if<Module*>(&value)) refer(*module);
  if (auto* modules = std::get_if<Modules>(&value)) referToAll(*modules);
}

// On an exception to none of them.
void Attribute::referToAll(Modules const& modules) {
  auto referred = modules.begin();
  try {
    for (; referred != modules.end(); ++referred) refer(*referred);
  } catch (...) {
    while (referred != modules.begin()) release(*--referred);
    throw;
  }
}

void Attribute::releaseFrom(Value const& value) {
  if (auto* module = std::get_if<Module*>(&value)) release(*module);
  if (auto* modules = std::get_if<Modules>(&value))
    for (Module* module : *modules) release(module);
}

void Attribute::store(Value value, bool set, bool react) {
  record();
  referTo(value);
  releaseFrom(m_value);
  put(std::move(value), set, react);
}

// Setting the value that is there again is no change.
struct Attribute::Change : UndoChange {
  explicit Change(Attribute& concerned)
      : UndoChange(concerned.m_module),
        attribute(concerned),
        value(concerned.m_value),
        set(concerned.m_set) {}

  void swap() override {
    Value now = attribute.m_value;
    bool const wasSet = attribute.m_set;
    attribute.store(std::move(value), set, false);
    value = std::move(now);
    set = wasSet;
  }
  bool isVoid() const override { return value == attribute.m_value && set == attribute.m_set; }
  int64 memoryUse() const override {
    return static_cast<int64>(sizeof *this) + std::max(bytesBeside(value), bytesBeside(attribute.m_value));
  }

  void tell(ChangeSetBuilder& changes) const override {
    // The name and the selection have changes of their own.
    changes.tell(SceneChange::Kind::attribute, attribute.m_module, attribute.m_name.GetString(),
                 text(value, set), text(attribute.m_value, attribute.m_set), !isVoid());
  }
  static std::string text(Value const& value, bool set) { return set ? textOf(value) : "not set"; }

  Attribute& attribute;
  Value value;
  bool set;
};

int64 Attribute::bytesBeside(Value const& value) {
  size_t bytes = 0;
  if (auto* text = std::get_if<HString>(&value)) bytes = text->GetString().capacity();
  if (auto* modules = std::get_if<Modules>(&value)) bytes = modules->capacity() * sizeof(Module*);
  if (auto* bits = std::get_if<Bits>(&value)) bytes = bits->capacity() / 8;
  if (auto* matrix = std::get_if<Matrix>(&value)) bytes = matrix->rows() * matrix->cols() * sizeof(double);
  return static_cast<int64>(bytes);
}

void Attribute::record() {
  if (m_module && m_module->isRecorded()) m_module->journal().addOnce<Change>(m_undoMark, *this);
}

void Attribute::put(Value value, bool set, bool react) {
  m_value = std::move(value);
  m_set = set;
  if (react && m_reaction && m_module) m_reaction(*m_module, *this);
}

void Attribute::change(Value value, bool, bool react, bool markSet) {
  store(std::move(value), m_set || markSet, react);
}

void Attribute::unset(bool, bool, bool react) { store(m_default, false, react); }

void Attribute::forget(Module* module) {
  auto const* modules = std::get_if<Modules>(&m_value);
  if (!modules) return store(static_cast<Module*>(nullptr), m_set, true);
  record();
  // The others are referred to as before: releasing and taking them all would cost too much in a long list.
  Modules others;
  others.reserve(modules->size());
  std::remove_copy(modules->begin(), modules->end(), std::back_inserter(others), module);
  for (size_t gone = modules->size() - others.size(); gone > 0; --gone) release(module);
  put(std::move(others), m_set, true);
}

// --- what values can be held ---

bool Attribute::isInLimits(double value) { return std::isfinite(value); }

bool Attribute::isInLimits(int64 ticks) { return ticks >= -kForever && ticks <= kForever; }

bool Attribute::isInLimits(Vec3 const& value) { return isFinite(value); }

bool Attribute::isInLimits(Matrix const& value) {
  for (uint64 row = 0; row < value.rows(); ++row)
    if (!std::all_of(value[row], value[row] + value.cols(), [](double v) { return std::isfinite(v); }))
      return false;
  return true;
}

bool Attribute::isOfScene(Module const* module) const {
  return !module || !getModule() || module->getDatabase() == getModule()->getDatabase();
}

bool ColorAttribute::canHold(Vec3 const& value) const {
  for (int i = 0; i < 3; ++i)
    if (!(value[i] >= 0 && value[i] <= 255)) return false;
  return true;
}

// --- kinds of their own ---

namespace {

int indexOf(Attribute::Labels const& labels, HString const& label) {
  if (!labels) return -1;
  auto const found = std::find(labels->begin(), labels->end(), label);
  return found == labels->end() ? -1 : static_cast<int>(found - labels->begin());
}

}  // namespace

HString EnumAttribute::getEnumValue() const { return m_labels ? itemAt(*m_labels, getIndex()) : HString(); }

int EnumAttribute::findLabel(HString const& label) const { return indexOf(m_labels, label); }

bool EnumAttribute::setValue(HString const& label, bool undoable, bool notify, bool react, bool markSet) {
  return setIndex(findLabel(label), undoable, notify, react, markSet);
}

bool EnumAttribute::setIndex(int index, bool, bool notify, bool react, bool markSet) {
  if (index < 0 || index >= getNumItems()) return false;
  change(index, notify, react, markSet);
  return true;
}

bool StringAttribute::setValue(HString const& value, bool, bool notify, int, bool react, bool markSet) {
  change(value, notify, react, markSet);
  return true;
}

HString NameAttribute::getValue() const { return getModule()->getName(); }

bool NameAttribute::setValue(HString const& value, bool, bool, int, bool, bool) {
  return getModule()->setName(value);
}

HString BitFieldAttribute::getLabel(int field) const {
  return m_labels ? itemAt(*m_labels, field) : HString();
}

int BitFieldAttribute::findLabel(HString const& label) const { return indexOf(m_labels, label); }

bool BitFieldAttribute::getField(int field) const { return itemAt(valueAs<Bits>(), field); }

bool BitFieldAttribute::setValue(HString const& label, bool on, bool, bool notify, bool react, bool markSet) {
  int const field = findLabel(label);
  if (field < 0) return false;
  Bits bits = valueAs<Bits>();
  bits[static_cast<size_t>(field)] = on;
  change(std::move(bits), notify, react, markSet);
  return true;
}

namespace {

HTimeManager const* timeOf(Attribute const& attribute) {
  Module const* module = attribute.getModule();
  return module ? module->getDatabase()->getTimeManager() : HTimeManager::getInstance();
}

}  // namespace

double TimeAttribute::getValue() const { return timeOf(*this)->getFrameDouble(getTime()); }

HString TimeAttribute::getStringValue() const {
  HTimeManager const* time = timeOf(*this);
  HFrameRate const rate = m_relative ? time->getFrameRate().withoutDrop() : time->getFrameRate();
  return rate.timecodeFromFrame(getTime() / rate.getTicksPerFrame());
}

void EventAttribute::doCallBack() { change(std::monostate(), true, true, true); }

bool MultiModAttribute::setValue(TSimpleArray<Module*>& value, bool, bool notify, bool react, bool markSet) {
  for (Module const* module : value)
    if (!isOfScene(module)) return false;
  change(Modules(value.begin(), value.end()), notify, react, markSet);
  return true;
}

Module* MultiModAttribute::getModuleValue(int i) const { return itemAt(valueAs<Modules>(), i); }
