#include "host/command/CommandPluginBase.h"

H_DEFINE_ABSTRACT_CLASS(HomCorePluginBase);
H_DEFINE_ABSTRACT_CLASS(CommandPluginBase);

void HomCorePluginBase::deleteThis() { HObject::deleteThis(); }

void CommandPluginBase::deleteThis() { HomCorePluginBase::deleteThis(); }

void CommandPluginBase::loadScriptCommands() {}

int CommandPluginBase::getNumScriptCommands() const { return 0; }

ScriptCmd* CommandPluginBase::getScriptCommand(int) const { return nullptr; }

int CommandPluginBase::getNumControlStreamCommands() const { return 0; }

ControlSystem::ICommandProvider* CommandPluginBase::getControlStreamCommand(int) const { return nullptr; }

int CommandPluginBase::getNumControlStreamEvents() const { return 0; }

ControlSystem::IEventProvider* CommandPluginBase::getControlStreamEvent(int) const { return nullptr; }
