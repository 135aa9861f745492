#include "xml/DocumentFile.h"

#if defined(_WIN32)
#include "win/DocumentFile.inc"
#else
#include "posix/DocumentFile.inc"
#endif
