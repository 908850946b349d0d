#include "host/services/HInterface.h"

namespace {

HInterface s_interface;

}  // namespace

HInterface* g_interface = &s_interface;

int HInterface::askQuestion(HString const& text, int) { return m_asker && m_asker(text) ? 1 : 0; }
