// Libraries beside the engine's own that are loaded when first needed: what they bring along would be felt at
// each start.
#pragma once

#include <string>

// The entry point of a library, which stays loaded. Null, with `problem`, when there is none.
void* findInEngineLibrary(char const* library, char const* entryPoint, std::string& problem);
