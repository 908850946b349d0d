#include "plugin/TalixDataCommandsPlugin.h"

#include <new>

#include "host/scene/Database.h"
#include "plugin/CommandList.h"

TalixDataCommandsPlugin* TalixDataCommandsPlugin::createInstance() {
  return new (std::nothrow) TalixDataCommandsPlugin;
}

void TalixDataCommandsPlugin::deleteThis() { delete this; }

HString TalixDataCommandsPlugin::getVendor() const { return "Norvak"; }

HString TalixDataCommandsPlugin::getAuthor() const { return getVendor(); }

HString TalixDataCommandsPlugin::getBuildDate() const { return "Jul 11 2024"; }

HString TalixDataCommandsPlugin::getInterfaceVersion() const { return "1.0"; }

HString TalixDataCommandsPlugin::getName() const { return "Talix Data Commands"; }

HString TalixDataCommandsPlugin::getVersion() const { return "2.00"; }

bool TalixDataCommandsPlugin::initialise() {
#define ADD(Class) addScriptCommand(new##Class());
  COMMANDS_1_TO_70(ADD)
  if (Database::isDevOnlyMode()) {
    DEVELOPER_COMMANDS_71_TO_77(ADD)
  }
  COMMANDS_78_TO_91(ADD)
  if (Database::isDevOnlyMode()) {
    DEVELOPER_COMMAND_92(ADD)
  }
  COMMANDS_93_TO_94(ADD)
#undef ADD
  return true;
}

bool TalixDataCommandsPlugin::addScriptCommand(Command* command) {
  m_scriptCommands.add(command);
  return true;
}

void TalixDataCommandsPlugin::addControlStreamCommand(ControlSystem::ICommandProvider* provider) {
  m_controlStreamCommands.add(provider);
}
