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
