#include "threads/TimerPrecision.h"

#if defined(_WIN32)
#include "win/TimerPrecision.inc"
#else
#include "posix/TimerPrecision.inc"
#endif
