#include "commands/markers/MarkerConnections.h"

#include "host/scene/Database.h"

bool readMarkers(Args const& args, char const* badPath, Marker*& source, Marker*& target) {
  Marker** const markers[] = {&source, &target};
  for (int i = 0; i < 2; ++i) {
    char const* path = args[i].getStringValue(-1);
    *markers[i] = objectAs<Marker>(g_db->getModuleWithPath(path, &Marker::s_classMarker, false));
    if (*markers[i]) continue;
    Command::logWarning(badPath, path);
    return false;
  }
  return true;
}
