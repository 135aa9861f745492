// Symbol visibility for the kelcore shared library.
//
// The library is built with hidden visibility; everything a host may call is marked
// KELCORE_API. Inline code and templates in the public headers need no mark.
#pragma once

#if defined(_WIN32)
#  if defined(KELCORE_BUILDING_LIBRARY)
#    define KELCORE_API __declspec(dllexport)
#  else
#    define KELCORE_API __declspec(dllimport)
#  endif
#else
#  define KELCORE_API __attribute__((visibility("default")))
#endif
