# Warning flags for every target of the project (not for consumers).
add_library(kelcore_warnings INTERFACE)
if(MSVC)
  target_compile_options(kelcore_warnings INTERFACE /W4)
  if(KELCORE_WERROR)
    target_compile_options(kelcore_warnings INTERFACE /WX)
  endif()
else()
  target_compile_options(kelcore_warnings INTERFACE -Wall -Wextra -Wpedantic
                         -Wshadow=local -Wnon-virtual-dtor -Wcast-align
                         -Woverloaded-virtual -Wnull-dereference)
  if(KELCORE_WERROR)
    target_compile_options(kelcore_warnings INTERFACE -Werror)
  endif()
endif()
