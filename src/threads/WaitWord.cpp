#include "threads/WaitWord.h"

static_assert(sizeof(std::atomic<std::uint32_t>) == sizeof(std::uint32_t),
              "the operating system sleeps on the word's own storage");

#if defined(_WIN32)
#include "win/WaitWord.inc"
#else
#include "posix/WaitWord.inc"
#endif
