#include "host/base/EngineLibrary.h"

#include <dlfcn.h>

void* findInEngineLibrary(char const* library, char const* entryPoint, std::string& problem) {
  // By its whole path, so that no other library of that name is taken.
  static char const here = 0;
  Dl_info engine{};
  std::string path;
  if (dladdr(&here, &engine) != 0 && engine.dli_fname) path = engine.dli_fname;
  path = path.substr(0, path.rfind('/') + 1) + library;
  void* const loaded = dlopen(path.c_str(), RTLD_NOW | RTLD_LOCAL);
  void* const found = loaded ? dlsym(loaded, entryPoint) : nullptr;
  if (found) return found;
  char const* text = dlerror();
  problem = text ? text : path + " cannot be used";
  return nullptr;
}
