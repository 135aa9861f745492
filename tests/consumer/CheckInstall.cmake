# Installs the freshly built library into a scratch prefix, then builds and runs a
# small program against it twice: through find_package(kelcore) and through pkg-config.
# Run with cmake -P; fails on the first step that does not work.
foreach(var KELCORE_BUILD_DIR CONSUMER_SOURCE_DIR WORK_DIR)
  if(NOT DEFINED ${var})
    message(FATAL_ERROR "${var} is not set")
  endif()
endforeach()

set(prefix ${WORK_DIR}/prefix)
file(REMOVE_RECURSE ${WORK_DIR})
file(MAKE_DIRECTORY ${WORK_DIR})

function(run_step what)
  execute_process(COMMAND ${ARGN} RESULT_VARIABLE rc OUTPUT_VARIABLE out ERROR_VARIABLE out)
  if(NOT rc EQUAL 0)
    message(FATAL_ERROR "${what} failed (${rc}):\n${out}")
  endif()
  message(STATUS "${what}: ok")
endfunction()

run_step("install" ${CMAKE_COMMAND} --install ${KELCORE_BUILD_DIR} --prefix ${prefix})

set(generator_args)
if(CMAKE_GENERATOR)
  set(generator_args -G ${CMAKE_GENERATOR})
endif()
run_step("configure consumer" ${CMAKE_COMMAND} ${generator_args}
         -S ${CONSUMER_SOURCE_DIR} -B ${WORK_DIR}/build
         -DCMAKE_PREFIX_PATH=${prefix} -DCMAKE_BUILD_TYPE=Release)
run_step("build consumer" ${CMAKE_COMMAND} --build ${WORK_DIR}/build)
run_step("run consumer (CMake package)" ${WORK_DIR}/build/consumer)

# pkg-config: compile the same program by hand with the flags kelcore.pc gives.
find_program(PKG_CONFIG pkg-config REQUIRED)
find_program(CXX_COMPILER NAMES c++ g++ clang++ REQUIRED)
file(GLOB_RECURSE pc_file ${prefix}/kelcore.pc)
get_filename_component(pc_dir "${pc_file}" DIRECTORY)
set(ENV{PKG_CONFIG_PATH} ${pc_dir})
execute_process(COMMAND ${PKG_CONFIG} --cflags --libs kelcore
                RESULT_VARIABLE rc OUTPUT_VARIABLE flags OUTPUT_STRIP_TRAILING_WHITESPACE)
if(NOT rc EQUAL 0)
  message(FATAL_ERROR "pkg-config does not know kelcore (looked in ${pc_dir})")
endif()
separate_arguments(flags UNIX_COMMAND "${flags}")
run_step("build consumer (pkg-config)" ${CXX_COMPILER} -std=c++20
         ${CONSUMER_SOURCE_DIR}/consumer.cpp -o ${WORK_DIR}/consumer-pc ${flags}
         -Wl,-rpath,${prefix}/lib)
run_step("run consumer (pkg-config)" ${WORK_DIR}/consumer-pc)
