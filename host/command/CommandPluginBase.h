// What the host asks of a plug-in library's object.
#pragma once

#include "host/base/HObject.h"
#include "host/base/HString.h"

class Command;
// A script command that a plug-in writes in the script language itself; none does so far.
class ScriptCmd;
namespace ControlSystem {
class ICommandProvider;
class IEventProvider;
}  // namespace ControlSystem

// The version of this interface: a library that returns another one from apiVersion() is not loaded.
inline constexpr int kPluginInterfaceVersion = 0x80000;

class HomCorePluginBase : public HObject {
  H_DECLARE_CLASS(HomCorePluginBase, HObject)

 public:
  void deleteThis() override;

  virtual HString getVendor() const = 0;
  virtual HString getAuthor() const = 0;
  virtual HString getBuildDate() const = 0;
  virtual HString getInterfaceVersion() const = 0;
  virtual HString getName() const = 0;
  virtual HString getVersion() const = 0;
  // Makes everything that the plug-in offers. Called once, before anything is counted.
  virtual bool initialise() = 0;
  virtual bool isReady() const = 0;
};

class CommandPluginBase : public HomCorePluginBase {
  H_DECLARE_CLASS(CommandPluginBase, HomCorePluginBase)

 public:
  void deleteThis() override;

  // The host holds the commands' only reference and releases them after the plug-in object is gone.
  virtual int getNumCommands() const = 0;
  virtual Command* getCommand(int index) const = 0;  // null beyond them

  virtual void loadScriptCommands();
  virtual int getNumScriptCommands() const;
  virtual ScriptCmd* getScriptCommand(int index) const;  // null beyond them
  virtual int getNumControlStreamCommands() const;
  virtual ControlSystem::ICommandProvider* getControlStreamCommand(int index) const;
  virtual int getNumControlStreamEvents() const;
  virtual ControlSystem::IEventProvider* getControlStreamEvent(int index) const;
};
