#include "utility/SmallBlockSystemMemory.h"

#if defined(_WIN32)
#include "win/VirtualMemory.inc"
#else
#include "posix/VirtualMemory.inc"
#endif
