#include "commands/properties/PropertyReading.h"
#include "host/command/Results.h"

namespace {

class GetBooleanPropertyCmd final : public ScriptCommand<GetBooleanPropertyCmd> {
 public:
  // More than a label is refused by the command itself, with its own message.
  static constexpr CommandInfo info = {
      .name = "getBooleanProperty",
      .displayName = "Get Boolean Property",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose = "Reads a property of a module as true or false; of a bit field, the one with a label.",
      .example = "getBooleanProperty LFHD Occluded",
      .args = {"moduleName propertyName", 2, ArgsInfo::kAny, {}, Variable::String},
      .argsText =
          "moduleName is a path, propertyName a channel or an attribute in exact case, a bit field followed "
          "by a label. A channel is read at the current time.",
      .options = {{"c", "the default value of the channel instead; no effect on attributes"},
                  {"d", "the same as -c"}},
      .returns = Variable::Bool,
      .solo = Solo::no};

  bool execute(Given const& given, Args const& args, Variable& result) override;
};

// Kept: a channel of another kind is an error, yet the command succeeds without a value.
bool readBoolean(Module const& module, HString const& name, DataSource::PropertyType kind, bool byDefault,
                 Variable& result) {
  switch (kind) {
    case DataSource::BoolProperty: {
      BoolController const* channel = channelNamed<BoolController>(module, name);
      return channel && answer(result, valueOf(*channel, byDefault));
    }
    case DataSource::FloatProperty:
      Command::logError("Use getFloatProperty for this type of property");
      return true;
    case DataSource::IntProperty:
      Command::logError("Use getIntProperty for this type of property");
      return true;
    default:
      Command::logError("Use getVectorProperty for this type of property");
      return true;
  }
}

// The third argument is the label.
bool readField(BitFieldAttribute const& bits, Args const& args, Variable& result) {
  if (args.getCount() != 3) {
    Command::logError("Not enough arguments for getBooleanProperty command");  // kept: for too many as well
    return false;
  }
  HString const label = args[2].getStringValue(-1);
  if (bits.findLabel(label) < 0) {
    Command::logError("\"%s\" is not a field in \"%s\"", label.GetStr(), bits.getName().GetStr());
    return false;
  }
  return answer(result, bits.getField(label));
}

bool GetBooleanPropertyCmd::execute(Given const& given, Args const& args, Variable& result) {
  Module const* module = moduleAt(args[0].getStringValue(-1));
  if (!module) return false;
  HString const name = args[1].getStringValue(-1);
  DataSource::PropertyType const kind = Controller::mapToPropertyType(name);
  if (kind != DataSource::NoProperty)
    return readBoolean(*module, name, kind, isByDefault<GetBooleanPropertyCmd>(given), result);
  Attribute const* attribute = attributeNamed(*module, name);
  if (!attribute) return false;
  if (BoolAttribute const* boolean = objectAs<BoolAttribute>(attribute))
    return answer(result, boolean->getValue());
  if (BitFieldAttribute const* bits = objectAs<BitFieldAttribute>(attribute))
    return readField(*bits, args, result);
  return redirect(Getter::Boolean, *attribute);
}

}  // namespace

Command* newGetBooleanPropertyCmd() { return new (std::nothrow) GetBooleanPropertyCmd; }
