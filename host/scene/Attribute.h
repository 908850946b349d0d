// A static value of a module: one class for each of the seventeen kinds.
//
// Setters end with four flags, true unless a caller has a reason: undoable and notify, which are the host's
// and do nothing (an open undo step records every change and tells of it), react (the module takes the change
// on, as a changed name renames it) and markSet (the attribute counts as set from now on). Those that return
// a bool return whether the value was taken.
#pragma once

#include <memory>
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

// Integers that a kind of attribute holds: getValue and setValue.
class IntAttribute : public Attribute {
  H_DECLARE_CLASS(IntAttribute, Attribute)

 public:
  explicit IntAttribute(int value = 0) : Attribute(value) {}
  Type getType() const override { return Integer; }
  int getValue() const { return valueAs<int>(); }
  bool setValue(int value, bool undoable, bool notify, bool react, bool markSet);
};

// Whole degrees Celsius.
class TemperatureAttribute : public Attribute {
  H_DECLARE_CLASS(TemperatureAttribute, Attribute)

 public:
  explicit TemperatureAttribute(int value = 0) : Attribute(value) {}
  Type getType() const override { return Temperature; }
  int getValue() const { return valueAs<int>(); }
  bool setValue(int value, bool undoable, bool notify, bool react, bool markSet);
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

class FloatAttribute : public Attribute {
  H_DECLARE_CLASS(FloatAttribute, Attribute)

 public:
  explicit FloatAttribute(double value = 0) : Attribute(value) {}
  Type getType() const override { return Float; }
  double getValue() const { return valueAs<double>(); }
  bool setValue(double value, bool undoable, bool notify, bool react, bool markSet);
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

// Text of several lines.
class MultiStringAttribute : public Attribute {
  H_DECLARE_CLASS(MultiStringAttribute, Attribute)

 public:
  explicit MultiStringAttribute(HString const& value = {}) : Attribute(value) {}
  Type getType() const override { return MultiString; }
  HString getValue() const { return valueAs<HString>(); }
  void setValue(HString const& value, bool undoable, bool notify, bool react, bool markSet);
};

class BoolAttribute : public Attribute {
  H_DECLARE_CLASS(BoolAttribute, Attribute)

 public:
  explicit BoolAttribute(bool value = false) : Attribute(value) {}
  Type getType() const override { return Boolean; }
  bool getValue() const { return valueAs<bool>(); }
  void setValue(bool value, bool undoable, bool notify, bool react, bool markSet);
};

class VectorAttribute : public Attribute {
  H_DECLARE_CLASS(VectorAttribute, Attribute)

 public:
  explicit VectorAttribute(Vec3 const& value = {}) : Attribute(value) {}
  Type getType() const override { return Vector; }
  Vec3 const& getValue() const { return valueAs<Vec3>(); }
  virtual void setValue(Vec3 const& value, bool undoable, bool notify, bool react, bool markSet);
};

class BitFieldAttribute : public Attribute {
  H_DECLARE_CLASS(BitFieldAttribute, Attribute)

 public:
  explicit BitFieldAttribute(Labels labels = nullptr)
      : Attribute(Bits(labels ? labels->size() : 0)), m_labels(std::move(labels)) {}
  Type getType() const override { return BitField; }
  int getNumFields() const { return static_cast<int>(valueAs<Bits>().size()); }
  HString getLabel(int field) const { return (*m_labels)[static_cast<size_t>(field)]; }
  Labels const& getLabels() const { return m_labels; }
  int findLabel(HString const& label) const;  // exact case; -1: none
  bool getField(int field) const;             // false outside the fields
  bool getField(HString const& label) const { return getField(findLabel(label)); }
  bool setValue(HString const& label, bool on, bool undoable, bool notify, bool react, bool markSet);

 private:
  Labels m_labels;
};

class RotationAttribute : public Attribute {
  H_DECLARE_CLASS(RotationAttribute, Attribute)

 public:
  explicit RotationAttribute(TalixRotation const& value = {}) : Attribute(value) {}
  Type getType() const override { return Rotation; }
  TalixRotation const& getValue() const { return valueAs<TalixRotation>(); }
  virtual void setValue(TalixRotation const& value, bool undoable, bool notify, bool react, bool markSet);
};

// Ticks, shown in frames and timecode.
class TimeAttribute : public Attribute {
  H_DECLARE_CLASS(TimeAttribute, Attribute)

 public:
  explicit TimeAttribute(int64 ticks = 0, bool relative = false) : Attribute(ticks), m_relative(relative) {}
  Type getType() const override { return Time; }
  int64 getTime() const { return valueAs<int64>(); }
  double getValue() const;                        // frames at its scene's rate
  HString getStringValue() const;                 // timecode of the whole frames
  bool isRelative() const { return m_relative; }  // a length of time rather than a moment
  void setValue(int64 ticks, bool undoable, bool notify, bool react, bool markSet);

 private:
  bool m_relative;
};

// Red, green and blue, 0 to 255. In default mode it follows the scene's colour for its kind.
class ColorAttribute : public Attribute {
  H_DECLARE_CLASS(ColorAttribute, Attribute)

 public:
  explicit ColorAttribute(Vec3 const& value = {}) : Attribute(value) {}
  Type getType() const override { return Color; }
  Vec3 const& getValue() const { return valueAs<Vec3>(); }
  bool isDefaultMode() const { return !isSet(); }
  void setValue(Vec3 const& value, bool undoable, bool notify, bool react, bool markSet);
  void setDefaultMode(bool undoable, bool notify);
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

// Another module, or none. A module that leaves the scene is no longer referenced; one of another scene is
// not taken.
class ModAttribute : public Attribute {
  H_DECLARE_CLASS(ModAttribute, Attribute)

 public:
  ModAttribute() : Attribute(static_cast<Module*>(nullptr)) {}
  Type getType() const override { return ModuleReference; }
  Module* getValue() const { return valueAs<Module*>(); }
  void setValue(Module* value, bool undoable, bool notify, bool react, bool markSet);
};

class MatrixAttribute : public Attribute {
  H_DECLARE_CLASS(MatrixAttribute, Attribute)

 public:
  MatrixAttribute() : Attribute(Matrix(3)) {}
  Type getType() const override { return MatrixKind; }
  Matrix const& getValue() const { return valueAs<Matrix>(); }
  virtual void setValue(Matrix const& value, bool undoable, bool notify, bool react, bool markSet);
};

// Modules in order; an entry may be null. None of another scene is taken.
class MultiModAttribute : public Attribute {
  H_DECLARE_CLASS(MultiModAttribute, Attribute)

 public:
  MultiModAttribute() : Attribute(Modules()) {}
  Type getType() const override { return MultiModule; }
  int getNumModules() const { return static_cast<int>(valueAs<Modules>().size()); }
  Module* getModuleValue(int i) const { return valueAs<Modules>()[static_cast<size_t>(i)]; }
  void setValue(TSimpleArray<Module*>& value, bool undoable, bool notify, bool react, bool markSet);
};
