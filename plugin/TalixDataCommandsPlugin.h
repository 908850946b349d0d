// The plug-in object: says who it is, makes every command once, and hands them out by index.
//
//  1. The arrays do not own what they hold: the host releases the commands after the plug-in object is gone.
//  2. Nothing is removed or moved once it is added; the order is that of CommandList.h.
//  3. A second initialise would add everything a second time; the host calls it once.
#pragma once

#include "host/base/TSimpleArray.h"
#include "host/command/CommandPluginBase.h"
#include "plugin/Export.h"

class TalixDataCommandsPlugin : public CommandPluginBase {
 public:
  // Null when memory runs out. The caller ends the object with deleteThis.
  TALIX_EXPORT static TalixDataCommandsPlugin* createInstance();
  TALIX_EXPORT void deleteThis() override;

  HString getVendor() const override;
  HString getAuthor() const override;
  HString getBuildDate() const override;
  HString getInterfaceVersion() const override;
  HString getName() const override;
  HString getVersion() const override;

  // Throws the text of TSimpleArray when memory runs out; what was added before stays.
  bool initialise() override;
  bool isReady() const override { return true; }

  int getNumCommands() const override { return m_scriptCommands.getCount(); }
  Command* getCommand(int index) const override {
    return index >= 0 && index < m_scriptCommands.getCount() ? m_scriptCommands[index] : nullptr;
  }
  int getNumControlStreamCommands() const override { return m_controlStreamCommands.getCount(); }
  ControlSystem::ICommandProvider* getControlStreamCommand(int index) const override {
    return m_controlStreamCommands[index];
  }

 private:
  bool addScriptCommand(Command* command);
  void addControlStreamCommand(ControlSystem::ICommandProvider* provider);

  TSimpleArray<Command*> m_scriptCommands;
  TSimpleArray<ControlSystem::ICommandProvider*> m_controlStreamCommands;
};
