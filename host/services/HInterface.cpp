#include "host/services/HInterface.h"

#include "host/services/SceneServices.h"

namespace {

HInterface s_interface;

}  // namespace

HInterface* g_interface = &s_interface;

int HInterface::askQuestion(HString const& text, int) {
  auto const& asker = SceneServices::getCurrent().asker;
  return asker && asker(text) ? 1 : 0;
}

void HInterface::setAsker(std::function<bool(HString const&)> asker) {
  SceneServices::getCurrent().asker = std::move(asker);
}
