#include "config/ThreadErrorState.h"

#if defined(_WIN32)
#include "win/ThreadErrorState.inc"
#else
#include "posix/ThreadErrorState.inc"
#endif
