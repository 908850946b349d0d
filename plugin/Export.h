// Marks what the library shows to its host; everything else stays inside.
#pragma once

#if defined(_WIN32)
#define TALIX_EXPORT __declspec(dllexport)
#else
#define TALIX_EXPORT __attribute__((visibility("default")))
#endif
