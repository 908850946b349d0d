// Variables that each thread has for itself.
#pragma once

// Read as fast as a global variable: by default each access from a shared library calls a function. For few
// and small ones, since they take from the little room that the loader keeps for libraries that come later.
#ifdef __GNUC__
#define TALIX_THREAD_LOCAL __attribute__((tls_model("initial-exec"))) constinit thread_local
#else
#define TALIX_THREAD_LOCAL constinit thread_local
#endif
