// A static value of a module: one class for each of the seventeen kinds.
//
// Setters end with four flags, true unless a caller has a reason: undoable and notify, which are the host's
// and do nothing (an open undo step records every change and tells of it), react (the module takes the change
// on, as a changed name renames it) and markSet (the attribute counts as set from now on). Those that return
// a bool return whether the value was taken.
#pragma once

#include <memory>
#include <type_traits>
#include <variant>
#include <vector>

#include "host/base/ControlID.h"
#include "host/base/HObject.h"
#include "host/base/HString.h"
#include "host/base/TSimpleArray.h"
#include "host/math/Matrix.h"
#include "host/math/TalixRotation.h"
#include "host/math/Vec3.h"
#include "host/scene/ModuleReferrer.h"

class Attribute : public HObject, private ModuleReferrer {
  H_DECLARE_CLASS(Attribute, HObject)

 public:
  ~Attribute() override;

  enum Type {
    Integer = 0,
    Enumeration = 1,
    Float = 2,
    String = 3,
    MultiString = 4,
    Boolean = 5,
    Vector = 6,
    BitField = 7,
    Rotation = 8,
    Time = 9,
    Color = 10,
    Event = 11,
    ModuleReference = 12,
    NoKind = 13,
    MatrixKind = 14,
    MultiModule = 15,
    Temperature = 16
  };
  using Labels = std::shared_ptr<std::vector<HString> const>;
  using Bits = std::vector<bool>;
  using Modules = std::vector<Module*>;
  using Value = std::variant<std::monostate, int, double, HString, bool, Vec3, Bits, TalixRotation, int64,
                             Module*, Modules, Matrix>;
  // What a module does when one of its attributes has changed.
  using Reaction = void (*)(Module&, Attribute&);

  // A new attribute of a kind with the kind's zero value; enumerations and bit fields take labels. A custom
  // attribute, a colour and a reference can be unset.
  static std::unique_ptr<Attribute> create(Type type, HString const& name, Labels labels = nullptr);

  virtual Type getType() const = 0;
  HString const& getName() const { return m_name; }
  ControlID getID() const { return m_id; }
  Module* getModule() const { return m_module; }
  bool isCustom() const { return m_custom; }

  bool canBeUnset() const { return m_canBeUnset; }
  bool isSet() const { return m_set; }
  // Back to the default value, and "not set".
  virtual void unset(bool undoable, bool notify, bool react);
  // Makes the present value the default one; the default of a reference always is none.
  void takeAsDefault();

  // The raw value, for copies, files and undo.
  Value const& getRawValue() const { return m_value; }
  Value const& getRawDefault() const { return m_default; }
  // Puts a value in place, with the references that it holds.
  virtual void store(Value value, bool set, bool react);

 protected:
  explicit Attribute(Value initial) : m_value(initial), m_default(std::move(initial)) {}
  // Stores and tells; `markSet` leaves an unset attribute unset when false.
  void change(Value value, bool notify, bool react, bool markSet);
  template <class T>
  T const& valueAs() const {
    return *std::get_if<T>(&m_value);
  }
  // Whether a module (null: none) is one of this attribute's own scene.
  bool isOfScene(Module const* module) const;
  static bool isInLimits(double value);
  static bool isInLimits(int64 ticks);
  static bool isInLimits(Vec3 const& value);
  static bool isInLimits(Matrix const& value);
  template <class T>
  static bool isInLimits(T const&) {
    return true;
  }

 private:
  friend class Module;

  // The mutator: every change of any attribute is recorded and then put in place.
  void record();
  void put(Value value, bool set, bool react);
  struct Change;
  static int64 bytesBeside(Value const& value);  // held outside of the value itself
  void forget(Module* module) override;
  void referTo(Value const& value);
  void referToAll(Modules const& modules);
  void releaseFrom(Value const& value);

  HString m_name;
  ControlID m_id;
  Module* m_module = nullptr;
  Value m_value, m_default;
  Reaction m_reaction = nullptr;
  bool m_custom = false;
  bool m_canBeUnset = false;
  bool m_set = false;
  uint64 m_undoMark = 0;
};

// A kind of attribute that holds one value as it is given.
template <class T, Attribute::Type kType>
class ValueAttribute : public Attribute {
 public:
  using Given = std::conditional_t<std::is_scalar_v<T>, T, T const&>;

  explicit ValueAttribute(T value = {}) : Attribute(Value(std::in_place_type<T>, std::move(value))) {}
  Type getType() const override { return kType; }
  Given getValue() const { return valueAs<T>(); }
  virtual bool setValue(Given value, bool, bool notify, bool react, bool markSet) {
    if (!canHold(value)) return false;
    change(Value(std::in_place_type<T>, value), notify, react, markSet);
    return true;
  }

 protected:
  // Numbers are finite, times lie on the time line.
  virtual bool canHold(Given value) const { return isInLimits(value); }
};

class IntAttribute : public ValueAttribute<int, Attribute::Integer> {
  H_DECLARE_CLASS(IntAttribute, Attribute)
  using ValueAttribute::ValueAttribute;
};

// Whole degrees Celsius.
class TemperatureAttribute : public ValueAttribute<int, Attribute::Temperature> {
  H_DECLARE_CLASS(TemperatureAttribute, Attribute)
  using ValueAttribute::ValueAttribute;
};

class FloatAttribute : public ValueAttribute<double, Attribute::Float> {
  H_DECLARE_CLASS(FloatAttribute, Attribute)
  using ValueAttribute::ValueAttribute;
};

class BoolAttribute : public ValueAttribute<bool, Attribute::Boolean> {
  H_DECLARE_CLASS(BoolAttribute, Attribute)
  using ValueAttribute::ValueAttribute;
};

class VectorAttribute : public ValueAttribute<Vec3, Attribute::Vector> {
  H_DECLARE_CLASS(VectorAttribute, Attribute)
  using ValueAttribute::ValueAttribute;
};

class RotationAttribute : public ValueAttribute<TalixRotation, Attribute::Rotation> {
  H_DECLARE_CLASS(RotationAttribute, Attribute)
  using ValueAttribute::ValueAttribute;
};

class MatrixAttribute : public ValueAttribute<Matrix, Attribute::MatrixKind> {
  H_DECLARE_CLASS(MatrixAttribute, Attribute)
  MatrixAttribute() : ValueAttribute(Matrix(3)) {}
};

// Text of several lines.
class MultiStringAttribute : public ValueAttribute<HString, Attribute::MultiString> {
  H_DECLARE_CLASS(MultiStringAttribute, Attribute)
  using ValueAttribute::ValueAttribute;
};

// Another module, or none. A module that leaves the scene is no longer referenced; one of another scene is
// not taken.
class ModAttribute : public ValueAttribute<Module*, Attribute::ModuleReference> {
  H_DECLARE_CLASS(ModAttribute, Attribute)
  using ValueAttribute::ValueAttribute;

 protected:
  bool canHold(Module* value) const override { return isOfScene(value); }
};

// Ticks, shown in frames and timecode.
class TimeAttribute : public ValueAttribute<int64, Attribute::Time> {
  H_DECLARE_CLASS(TimeAttribute, Attribute)

  explicit TimeAttribute(int64 ticks = 0, bool relative = false)
      : ValueAttribute(ticks), m_relative(relative) {}
  int64 getTime() const { return ValueAttribute::getValue(); }
  double getValue() const;                        // frames at its scene's rate
  HString getStringValue() const;                 // timecode of the whole frames
  bool isRelative() const { return m_relative; }  // a length of time rather than a moment

 private:
  bool m_relative;
};

// Red, green and blue, 0 to 255. In default mode it follows the scene's colour for its kind.
class ColorAttribute : public ValueAttribute<Vec3, Attribute::Color> {
  H_DECLARE_CLASS(ColorAttribute, Attribute)
  using ValueAttribute::ValueAttribute;

  bool isDefaultMode() const { return !isSet(); }
  void setDefaultMode(bool undoable, bool notify) { unset(undoable, notify, true); }

 protected:
  bool canHold(Vec3 const& value) const override;
};

class EnumAttribute : public Attribute {
  H_DECLARE_CLASS(EnumAttribute, Attribute)

 public:
  explicit EnumAttribute(Labels labels = nullptr) : Attribute(0), m_labels(std::move(labels)) {}
  Type getType() const override { return Enumeration; }
  int getIndex() const { return valueAs<int>(); }
  HString getEnumValue() const;  // empty when there are no items
  int getNumItems() const { return m_labels ? static_cast<int>(m_labels->size()) : 0; }
  Labels const& getLabels() const { return m_labels; }
  int findLabel(HString const& label) const;  // exact case; -1: none
  bool setValue(HString const& label, bool undoable, bool notify, bool react, bool markSet);
  bool setIndex(int index, bool undoable, bool notify, bool react, bool markSet);

 private:
  Labels m_labels;
};

class StringAttribute : public Attribute {
  H_DECLARE_CLASS(StringAttribute, Attribute)

 public:
  explicit StringAttribute(HString const& value = {}) : Attribute(value) {}
  Type getType() const override { return String; }
  virtual HString getValue() const { return valueAs<HString>(); }
  // The number is unused; it is part of the host's interface.
  virtual bool setValue(HString const& value, bool undoable, bool notify, int number, bool react,
                        bool markSet);
};

// The name of its module: setting it renames. Refuses names that cannot stand.
class NameAttribute final : public StringAttribute {
  H_DECLARE_CLASS(NameAttribute, StringAttribute)

 public:
  HString getValue() const override;
  bool setValue(HString const& value, bool undoable, bool notify, int number, bool react,
                bool markSet) override;
};

class BitFieldAttribute : public Attribute {
  H_DECLARE_CLASS(BitFieldAttribute, Attribute)

 public:
  explicit BitFieldAttribute(Labels labels = nullptr)
      : Attribute(Bits(labels ? labels->size() : 0)), m_labels(std::move(labels)) {}
  Type getType() const override { return BitField; }
  int getNumFields() const { return static_cast<int>(valueAs<Bits>().size()); }
  HString getLabel(int field) const;  // empty outside the fields
  Labels const& getLabels() const { return m_labels; }
  int findLabel(HString const& label) const;  // exact case; -1: none
  bool getField(int field) const;             // false outside the fields
  bool getField(HString const& label) const { return getField(findLabel(label)); }
  bool setValue(HString const& label, bool on, bool undoable, bool notify, bool react, bool markSet);

 private:
  Labels m_labels;
};

// A button: running it calls the module back.
class EventAttribute : public Attribute {
  H_DECLARE_CLASS(EventAttribute, Attribute)

 public:
  EventAttribute() : Attribute(std::monostate()) {}
  Type getType() const override { return Event; }
  void doCallBack();
};

class NoneAttribute : public Attribute {
  H_DECLARE_CLASS(NoneAttribute, Attribute)

 public:
  NoneAttribute() : Attribute(std::monostate()) {}
  Type getType() const override { return NoKind; }
};

// Modules in order; an entry may be null. None of another scene is taken.
class MultiModAttribute : public Attribute {
  H_DECLARE_CLASS(MultiModAttribute, Attribute)

 public:
  MultiModAttribute() : Attribute(Modules()) {}
  Type getType() const override { return MultiModule; }
  int getNumModules() const { return static_cast<int>(valueAs<Modules>().size()); }
  Module* getModuleValue(int i) const;  // null beyond them
  bool setValue(TSimpleArray<Module*>& value, bool undoable, bool notify, bool react, bool markSet);
};
