#include "host/command/ScriptCommand.h"
#include "host/scene/DataEdit.h"
#include "host/scene/Database.h"

namespace {

class CopyDataCmd final : public ScriptCommand<CopyDataCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "copyData",
      .displayName = "Copy Data",
      .category = "Data Editing",
      .purpose = "Copies the data of one channel to channels of other modules.",
      .example = "copyData LFHD.Translation RFHD.Translation",
      .args = {"module1.outputName module2.inputName1 ...", 2, ArgsInfo::kAny, {}, Variable::String},
      .argsText =
          "Channels as MODULE.CHANNEL, cut at the last dot: the source, then targets of the same kind. "
          "Copies the default value, the interpolation and the keys of the active clip, over what was there.",
      .solo = Solo::no};

  bool execute(Given const&, Args const& args, Variable&) override;
};

// By path, else the first module of that name.
Module* findModule(HString const& name) {
  Module* module = g_db->getModuleWithPath(name, nullptr, false);
  for (int i = 0; !module && i < g_db->getNumModules(); ++i)
    if (g_db->getModule(i)->getName() == name) module = g_db->getModule(i);
  return module;
}

// The channel that "module.plug" names. Without one logs why and returns null.
Controller* findPlug(HString const& text) {
  int const dot = text.ReverseFind('.');
  if (dot < 0) {
    Command::logError("No I/O plug specified for module %s", text.GetStr());
    return nullptr;
  }
  HString const path = text.Left(static_cast<uint64>(dot));
  HString const plug = text.Right(static_cast<uint64>(text.GetLength() - dot - 1));
  Module const* module = findModule(path);
  if (!module) {
    Command::logError("Module %s does not exist", path.GetStr());
    return nullptr;
  }
  Controller* channel = module->getChannel(plug.GetStr());
  if (!channel) Command::logError("Input %s does not exist on module %s", plug.GetStr(), path.GetStr());
  return channel;
}

bool CopyDataCmd::execute(Given const&, Args const& args, Variable&) {
  HString const from = args[0].getStringValue(-1);
  Controller const* source = findPlug(from);
  if (!source) return false;
  bool copied = false;
  for (int i = 1; i < args.getCount(); ++i) {
    HString const to = args[i].getStringValue(-1);
    Controller* destination = findPlug(to);
    if (!destination) return false;
    DataEdit const edit(*destination);
    if (destination->copyFrom(source, true, false))
      copied = true;
    else
      logError("Could not copy data from %s to %s", from.GetStr(), to.GetStr());
  }
  return copied;
}

}  // namespace

Command* newCopyDataCmd() { return new (std::nothrow) CopyDataCmd; }
