// Run-time classes: one constant record per class of host object. Type tests take constant time, because a
// record knows its depth in the class tree and its ancestors.
#pragma once

#include <array>
#include <string_view>

class HObject;

class HRuntimeClass {
 public:
  using Create = HObject* (*)();
  enum Instances : bool { any, single };

  template <size_t Depth>
  constexpr HRuntimeClass(char const* name, std::array<HRuntimeClass const*, Depth> const& ancestors,
                          Create create, Instances instances)
      : m_name(name),
        m_ancestors(ancestors.data()),
        m_depth(Depth),
        m_create(create),
        m_single(instances == single) {}

  char const* getName() const { return m_name; }
  HRuntimeClass const* getBaseClass() const { return m_depth ? m_ancestors[m_depth - 1] : nullptr; }
  // Null when the class is abstract.
  Create getCreateFunction() const { return m_create; }
  // At most one object of the class may be in a scene.
  bool isSingleInstance() const { return m_single; }

  // Whether this class is `other` or derives from it.
  bool isDerivedFrom(HRuntimeClass const* other) const {
    return this == other || (other && other->m_depth < m_depth && m_ancestors[other->m_depth] == other);
  }

  // The class with this exact name, or null.
  static HRuntimeClass* findClass(char const* name);

 private:
  char const* m_name;
  HRuntimeClass const* const* m_ancestors;  // from HObject down to the base
  size_t m_depth;
  Create m_create;
  bool m_single;
};

// The ancestors of a class, from HObject down to its base: the base's ancestors and the base.
template <class Base>
struct HClassAncestors {
  static constexpr auto make() {
    std::array<HRuntimeClass const*, Base::kClassDepth + 1> all{};
    if constexpr (Base::kClassDepth > 0) {
      auto const above = HClassAncestors<typename Base::ClassBase>::make();
      for (size_t i = 0; i < above.size(); ++i) all[i] = above[i];
    }
    all.back() = &Base::staticClass();
    return all;
  }
  static constexpr auto value = make();
};

// In a class: declares its record s_classNAME and the virtual that returns it.
#define H_DECLARE_CLASS(Name, Base)                                       \
 public:                                                                  \
  using ClassBase = Base;                                                 \
  static constexpr size_t kClassDepth = Base::kClassDepth + 1;            \
  static HRuntimeClass s_class##Name;                                     \
  static constexpr HRuntimeClass& staticClass() { return s_class##Name; } \
  HRuntimeClass* getRuntimeClass() const override { return &s_class##Name; }

// In one source file: defines the record of an abstract class, a class that can be created, a class of which
// a scene holds one.
#define H_DEFINE_CLASS_(Name, create, instances)                                                      \
  constinit HRuntimeClass Name::s_class##Name(#Name, HClassAncestors<Name::ClassBase>::value, create, \
                                              instances)
#define H_DEFINE_ABSTRACT_CLASS(Name) H_DEFINE_CLASS_(Name, nullptr, HRuntimeClass::any)
#define H_DEFINE_CLASS(Name) \
  H_DEFINE_CLASS_(           \
      Name, []() -> HObject* { return new Name; }, HRuntimeClass::any)
#define H_DEFINE_SINGLE_CLASS(Name) \
  H_DEFINE_CLASS_(                  \
      Name, []() -> HObject* { return new Name; }, HRuntimeClass::single)
