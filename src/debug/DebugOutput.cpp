#include "debug/DebugOutput.h"

#if defined(_WIN32)
#include "win/DebugOutput.inc"
#else
#include "posix/DebugOutput.inc"
#endif
