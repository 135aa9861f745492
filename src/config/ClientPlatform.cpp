#include "config/ClientPlatform.h"

#if defined(_WIN32)
#include "win/ClientPlatform.inc"
#else
#include "posix/ClientPlatform.inc"
#endif
