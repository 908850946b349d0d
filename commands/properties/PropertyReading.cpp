#include "commands/properties/PropertyReading.h"

#include "host/command/Results.h"

namespace {

constexpr char const kInt[] = "Use getIntProperty for this type of attribute";
constexpr char const kIntOrString[] =
    "Use either getIntProperty or getStringProperty for this type of attribute";
constexpr char const kFloat[] = "Use getFloatProperty for this type of attribute";
constexpr char const kString[] = "Use getStringProperty for this type of attribute";
constexpr char const kBoolean[] = "Use getBooleanProperty for this type of attribute";
constexpr char const kVector[] = "Use getVectorProperty for this type of attribute";
constexpr char const kBooleans[] = "Use getBooleanArrayProperty for this type of attribute";
constexpr char const kInts[] = "Use getIntArrayProperty for this type of attribute";
constexpr char const kNone[] = "Unsupported attribute type";

// Rows are kinds of attribute, columns the getters; null where the getter reads the kind itself. Kept uneven:
// a module reference is unsupported for two getters and redirected by three, a temperature likewise.
constexpr char const* kInstead[][6] = {
    // Int, Boolean, String, BooleanArray, IntArray, StringArray
    {nullptr, kInt, kInt, kInt, kInt, kInt},                                // integer
    {nullptr, kIntOrString, nullptr, kIntOrString, kIntOrString, kString},  // enumeration
    {kFloat, kFloat, kFloat, kFloat, kFloat, kFloat},                       // float
    {kString, kString, nullptr, kString, kString, kString},                 // string
    {kString, kString, nullptr, kString, kString, kString},                 // multi-string
    {kBoolean, nullptr, kBoolean, kBoolean, kBoolean, kBoolean},            // boolean
    {kVector, kVector, kVector, kVector, kVector, kVector},                 // vector
    {kBooleans, nullptr, kBooleans, nullptr, kBooleans, kBooleans},         // bit field
    {kVector, kVector, kVector, kVector, kVector, kVector},                 // rotation
    {nullptr, kInt, nullptr, kInt, kInt, kString},                          // time
    {kInts, kInts, kInts, kInts, nullptr, kInts},                           // colour
    {kNone, kNone, kNone, kNone, kNone, kNone},                             // event
    {kNone, kNone, nullptr, kString, kString, kString},                     // module reference
    {kNone, kNone, kNone, kNone, kNone, kNone},                             // none
    {kNone, kNone, kNone, kNone, kNone, kNone},                             // matrix
    {kNone, kNone, kNone, kNone, kNone, nullptr},                           // multi-module
    {nullptr, kNone, kNone, kNone, kNone, kInt},                            // temperature
};

}  // namespace

bool redirect(Getter getter, Attribute const& attribute) {
  auto const kind = static_cast<size_t>(attribute.getType());
  char const* text = kind < std::size(kInstead) ? kInstead[kind][static_cast<size_t>(getter)] : kNone;
  Command::logError("%s", text);
  return false;
}

Attribute const* attributeNamed(Module const& module, HString const& name) {
  Attribute const* attribute = module.getAttribute(name.GetStr());
  if (!attribute) Command::logError("Unknown property type: %s", name.GetStr());
  return attribute;
}

Attribute const* attributeAt(Args const& args, char const* badPath) {
  Module const* module = moduleAt(args[0].getStringValue(-1), badPath);
  return module ? attributeNamed(*module, args[1].getStringValue(-1)) : nullptr;
}

bool readNumber(Args const& args, char const* badPath, bool byDefault, Variable& result) {
  Module const* module = moduleAt(args[0].getStringValue(-1), badPath);
  if (!module) return false;
  double value = 0;
  HString const problem = module->getPropertyVal(args[1].getStringValue(-1), value, byDefault);
  if (problem.IsEmpty()) return answer(result, value);
  Command::logError("%s", problem.GetStr());
  return false;
}
