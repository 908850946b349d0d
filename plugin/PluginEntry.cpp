// What the host looks up by name after loading the library.
#include "plugin/TalixDataCommandsPlugin.h"

extern "C" {

TALIX_EXPORT int apiVersion() { return kPluginInterfaceVersion; }

// Whether this is a debug build, which a release host would not load.
TALIX_EXPORT bool isDebug() { return false; }

TALIX_EXPORT int getNumPlugins() { return 1; }

// A new object at each call; the library keeps no pointer to it.
TALIX_EXPORT CommandPluginBase* getPlugin(int index) {
  return index == 0 ? TalixDataCommandsPlugin::createInstance() : nullptr;
}

TALIX_EXPORT bool isVenzo() { return false; }
}
