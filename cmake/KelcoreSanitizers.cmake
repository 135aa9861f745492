# KELCORE_SANITIZE applies to everything built in this tree, the library included,
# so that the instrumented library and its tests agree.
if(KELCORE_SANITIZE)
  set(_kel_san_flags -fsanitize=${KELCORE_SANITIZE} -fno-omit-frame-pointer)
  if(KELCORE_SANITIZE MATCHES "undefined")
    list(APPEND _kel_san_flags -fno-sanitize-recover=undefined)
  endif()
  add_compile_options(${_kel_san_flags})
  add_link_options(-fsanitize=${KELCORE_SANITIZE})
endif()

# KELCORE_FUZZ instruments everything for coverage-guided fuzzing, with AddressSanitizer
# and UndefinedBehaviorSanitizer; only the fuzz targets link libFuzzer's driver.
if(KELCORE_FUZZ)
  if(NOT CMAKE_CXX_COMPILER_ID MATCHES "Clang")
    message(FATAL_ERROR "KELCORE_FUZZ needs clang (for example CXX=clang++-14)")
  endif()
  if(KELCORE_SANITIZE)
    message(FATAL_ERROR "KELCORE_FUZZ brings its own sanitizers; leave KELCORE_SANITIZE empty")
  endif()
  add_compile_options(-fsanitize=fuzzer-no-link,address,undefined -fno-omit-frame-pointer
                      -fno-sanitize-recover=undefined)
  add_link_options(-fsanitize=address,undefined)
endif()
