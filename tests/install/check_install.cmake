# Installs the build tree into a fresh prefix, then builds and runs a tiny host program against it,
# once through find_package(plotaid CONFIG) and once through pkg-config. With MODE=subdirectory,
# builds the host with the source tree added by add_subdirectory instead.
file(REMOVE_RECURSE ${WORK_DIR})
set(prefix ${WORK_DIR}/prefix)

function(run)
  execute_process(COMMAND ${ARGN} RESULT_VARIABLE rc OUTPUT_VARIABLE out ERROR_VARIABLE err)
  if(NOT rc EQUAL 0)
    message(FATAL_ERROR "failed (${rc}): ${ARGN}\n${out}\n${err}")
  endif()
  set(LAST_OUTPUT "${out}" PARENT_SCOPE)
endfunction()

# add_subdirectory: the source tree inside a host's build, linked by the same target name.
if(MODE STREQUAL "subdirectory")
  run(${CMAKE_COMMAND} -S ${SOURCE_DIR}/tests/install/subdir -B ${WORK_DIR}/subdir-host -G Ninja
      -DPLOTAID_SOURCE_DIR=${SOURCE_DIR} -DCMAKE_CXX_COMPILER_LAUNCHER=${LAUNCHER}
      -DCMAKE_C_COMPILER_LAUNCHER=${LAUNCHER})
  run(${CMAKE_COMMAND} --build ${WORK_DIR}/subdir-host --target host)
  run(${WORK_DIR}/subdir-host/host)
  if(NOT LAST_OUTPUT MATCHES "host ok")
    message(FATAL_ERROR "add_subdirectory host printed: ${LAST_OUTPUT}")
  endif()
  return()
endif()

run(${CMAKE_COMMAND} --install ${BINARY_DIR} --prefix ${prefix})

# The installed tool runs from the prefix on the installed shared library.
run(${prefix}/bin/plotaid --help)
execute_process(COMMAND ldd ${prefix}/bin/plotaid OUTPUT_VARIABLE linked)
if(NOT linked MATCHES "libplotaid\\.so\\.1 => ${prefix}/")
  message(FATAL_ERROR "the installed tool does not use the installed libplotaid:\n${linked}")
endif()

# find_package
run(${CMAKE_COMMAND} -S ${SOURCE_DIR}/tests/install/host -B ${WORK_DIR}/cmake-host -G Ninja
    -DCMAKE_PREFIX_PATH=${prefix} -DCMAKE_BUILD_TYPE=Release)
run(${CMAKE_COMMAND} --build ${WORK_DIR}/cmake-host)
run(${WORK_DIR}/cmake-host/host)
if(NOT LAST_OUTPUT MATCHES "host ok")
  message(FATAL_ERROR "find_package host printed: ${LAST_OUTPUT}")
endif()

# pkg-config
set(ENV{PKG_CONFIG_PATH} ${prefix}/lib/pkgconfig)
execute_process(COMMAND pkg-config --cflags --libs plotaid OUTPUT_VARIABLE flags RESULT_VARIABLE rc
                OUTPUT_STRIP_TRAILING_WHITESPACE)
if(NOT rc EQUAL 0)
  message(FATAL_ERROR "pkg-config does not know plotaid")
endif()
separate_arguments(flags UNIX_COMMAND "${flags}")
run(c++ -std=c++17 ${SOURCE_DIR}/tests/install/host/host.cpp -o ${WORK_DIR}/pc-host ${flags}
    -Wl,-rpath,${prefix}/lib)
run(${WORK_DIR}/pc-host)
if(NOT LAST_OUTPUT MATCHES "host ok")
  message(FATAL_ERROR "pkg-config host printed: ${LAST_OUTPUT}")
endif()
