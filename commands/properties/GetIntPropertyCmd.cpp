#include "commands/properties/PropertyReading.h"
#include "host/command/Results.h"

namespace {

class GetIntPropertyCmd final : public ScriptCommand<GetIntPropertyCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getIntProperty",
      .displayName = "Get Integer Property",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose = "Reads a property of a module as a whole number.",
      .example = "getIntProperty LFHD FillType",
      .args = {"moduleName propertyName", 2, 2, {Variable::String, Variable::String}},
      .argsText =
          "moduleName is a path, propertyName a channel or an attribute in exact case. Fractions are cut. A "
          "channel is read at the current time, a time attribute in frames, an enumeration as its index.",
      .options = {{"c", "the default value of the channel instead; no effect on attributes"},
                  {"d", "the same as -c"}},
      .returns = Variable::Int,
      .solo = Solo::no};

  bool execute(Given const& given, Args const& args, Variable& result) override;
};

bool readInteger(Module const& module, HString const& name, DataSource::PropertyType kind, bool byDefault,
                 Variable& result) {
  if (kind == DataSource::FloatProperty) {
    FloatController const* channel = channelNamed<FloatController>(module, name);
    return channel && answerTruncated(result, valueOf(*channel, byDefault));
  }
  if (kind == DataSource::IntProperty) {
    IntController const* channel = channelNamed<IntController>(module, name);
    return channel && answer(result, valueOf(*channel, byDefault));
  }
  // Kept: these are errors, yet the command succeeds without a value, and there is no getBoolProperty.
  Command::logError(kind == DataSource::BoolProperty ? "Use getBoolProperty for this type of property"
                                                     : "Use getVectorProperty for this type of property");
  return true;
}

bool readAttribute(Attribute const& attribute, Variable& result) {
  switch (attribute.getType()) {
    case Attribute::Integer:
      return answer(result, static_cast<IntAttribute const&>(attribute).getValue());
    case Attribute::Enumeration:
      return answer(result, static_cast<EnumAttribute const&>(attribute).getIndex());
    case Attribute::Temperature:
      return answer(result, static_cast<TemperatureAttribute const&>(attribute).getValue());
    case Attribute::Time:
      return answerTruncated(result, static_cast<TimeAttribute const&>(attribute).getValue());
    default:
      return redirect(Getter::Int, attribute);
  }
}

bool GetIntPropertyCmd::execute(Given const& given, Args const& args, Variable& result) {
  Module const* module =
      moduleAt(args[0].getStringValue(-1),
               "%s  is not a valid unique path to a Module in the scene.");  // two spaces: kept
  if (!module) return false;
  HString const name = args[1].getStringValue(-1);
  DataSource::PropertyType const kind = Controller::mapToPropertyType(name);
  if (kind != DataSource::NoProperty)
    return readInteger(*module, name, kind, isByDefault<GetIntPropertyCmd>(given), result);
  Attribute const* attribute = attributeNamed(*module, name);
  return attribute && readAttribute(*attribute, result);
}

}  // namespace

Command* newGetIntPropertyCmd() { return new (std::nothrow) GetIntPropertyCmd; }
