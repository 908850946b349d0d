#include "host/scene/Attribute.h"

#include <algorithm>
#include <cmath>

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

std::unique_ptr<Attribute> Attribute::create(Type type, HString const& name, Labels labels) {
  std::unique_ptr<Attribute> attribute;
  switch (type) {
    case Integer:
      attribute = std::make_unique<IntAttribute>();
      break;
    case Enumeration:
      attribute = std::make_unique<EnumAttribute>(std::move(labels));
      break;
    case Float:
      attribute = std::make_unique<FloatAttribute>();
      break;
    case String:
      attribute = std::make_unique<StringAttribute>();
      break;
    case MultiString:
      attribute = std::make_unique<MultiStringAttribute>();
      break;
    case Boolean:
      attribute = std::make_unique<BoolAttribute>();
      break;
    case Vector:
      attribute = std::make_unique<VectorAttribute>();
      break;
    case BitField:
      attribute = std::make_unique<BitFieldAttribute>(std::move(labels));
      break;
    case Rotation:
      attribute = std::make_unique<RotationAttribute>();
      break;
    case Time:
      attribute = std::make_unique<TimeAttribute>();
      break;
    case Color:
      attribute = std::make_unique<ColorAttribute>(Database::getDefaultModColor());
      break;
    case Event:
      attribute = std::make_unique<EventAttribute>();
      break;
    case ModuleReference:
      attribute = std::make_unique<ModAttribute>();
      break;
    case NoKind:
      attribute = std::make_unique<NoneAttribute>();
      break;
    case MatrixKind:
      attribute = std::make_unique<MatrixAttribute>();
      break;
    case MultiModule:
      attribute = std::make_unique<MultiModAttribute>();
      break;
    case Temperature:
      attribute = std::make_unique<TemperatureAttribute>();
      break;
  }
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
    const bool wasSet = attribute.m_set;
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

bool IntAttribute::setValue(int value, bool, bool notify, bool react, bool markSet) {
  change(value, notify, react, markSet);
  return true;
}

bool TemperatureAttribute::setValue(int value, bool, bool notify, bool react, bool markSet) {
  change(value, notify, react, markSet);
  return true;
}

namespace {

int indexOf(Attribute::Labels const& labels, HString const& label) {
  if (!labels) return -1;
  const auto found = std::find(labels->begin(), labels->end(), label);
  return found == labels->end() ? -1 : static_cast<int>(found - labels->begin());
}

bool isFinite(Vec3 const& v) { return std::isfinite(v.x) && std::isfinite(v.y) && std::isfinite(v.z); }

}  // namespace

HString EnumAttribute::getEnumValue() const {
  const int index = getIndex();
  return index >= 0 && index < getNumItems() ? (*m_labels)[static_cast<size_t>(index)] : HString();
}

int EnumAttribute::findLabel(HString const& label) const { return indexOf(m_labels, label); }

bool EnumAttribute::setValue(HString const& label, bool undoable, bool notify, bool react, bool markSet) {
  return setIndex(findLabel(label), undoable, notify, react, markSet);
}

bool EnumAttribute::setIndex(int index, bool, bool notify, bool react, bool markSet) {
  if (index < 0 || index >= getNumItems()) return false;
  change(index, notify, react, markSet);
  return true;
}

bool FloatAttribute::setValue(double value, bool, bool notify, bool react, bool markSet) {
  if (!std::isfinite(value)) return false;
  change(value, notify, react, markSet);
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

void MultiStringAttribute::setValue(HString const& value, bool, bool notify, bool react, bool markSet) {
  change(value, notify, react, markSet);
}

void BoolAttribute::setValue(bool value, bool, bool notify, bool react, bool markSet) {
  change(value, notify, react, markSet);
}

void VectorAttribute::setValue(Vec3 const& value, bool, bool notify, bool react, bool markSet) {
  if (isFinite(value)) change(value, notify, react, markSet);
}

int BitFieldAttribute::findLabel(HString const& label) const { return indexOf(m_labels, label); }

bool BitFieldAttribute::getField(int field) const {
  return field >= 0 && field < getNumFields() && valueAs<Bits>()[static_cast<size_t>(field)];
}

bool BitFieldAttribute::setValue(HString const& label, bool on, bool, bool notify, bool react, bool markSet) {
  const int field = findLabel(label);
  if (field < 0) return false;
  Bits bits = valueAs<Bits>();
  bits[static_cast<size_t>(field)] = on;
  change(std::move(bits), notify, react, markSet);
  return true;
}

void RotationAttribute::setValue(TalixRotation const& value, bool, bool notify, bool react, bool markSet) {
  change(value, notify, react, markSet);
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
  const HFrameRate rate = m_relative ? time->getFrameRate().withoutDrop() : time->getFrameRate();
  return rate.timecodeFromFrame(time->getFrame(getTime()));
}

void TimeAttribute::setValue(int64 ticks, bool, bool notify, bool react, bool markSet) {
  change(std::clamp(ticks, -kForever, kForever), notify, react, markSet);
}

void ColorAttribute::setValue(Vec3 const& value, bool, bool notify, bool react, bool markSet) {
  if (isFinite(value)) change(value, notify, react, markSet);
}

void ColorAttribute::setDefaultMode(bool undoable, bool notify) { unset(undoable, notify, true); }

void EventAttribute::doCallBack() { change(std::monostate(), true, true, true); }

void ModAttribute::setValue(Module* value, bool, bool notify, bool react, bool markSet) {
  if (value && getModule() && value->getDatabase() != getModule()->getDatabase()) return;
  change(value, notify, react, markSet);
}

void MatrixAttribute::setValue(Matrix const& value, bool, bool notify, bool react, bool markSet) {
  for (uint64 row = 0; row < value.rows(); ++row)
    if (!std::all_of(value[row], value[row] + value.cols(), [](double v) { return std::isfinite(v); }))
      return;
  change(value, notify, react, markSet);
}

void MultiModAttribute::setValue(TSimpleArray<Module*>& value, bool, bool notify, bool react, bool markSet) {
  for (Module const* module : value)
    if (module && getModule() && module->getDatabase() != getModule()->getDatabase()) return;
  change(Modules(value.begin(), value.end()), notify, react, markSet);
}
