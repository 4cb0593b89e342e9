# Driven by CTest: install, configure the outside project, build it, run it.
function(run)
  execute_process(COMMAND ${ARGN} RESULT_VARIABLE rc OUTPUT_VARIABLE out ERROR_VARIABLE err)
  if(NOT rc EQUAL 0)
    message(FATAL_ERROR "failed (${rc}): ${ARGN}\n${out}\n${err}")
  endif()
  set(LAST_OUTPUT "${out}" PARENT_SCOPE)
endfunction()

set(prefix ${WORK_DIR}/prefix)
file(REMOVE_RECURSE ${WORK_DIR})
run(${CMAKE_COMMAND} --install ${BUILD_DIR} --prefix ${prefix})

# The CMake package.
run(${CMAKE_COMMAND} -S ${SOURCE_DIR} -B ${WORK_DIR}/build
    -DCMAKE_PREFIX_PATH=${prefix} -DCMAKE_CXX_COMPILER=${CXX} -DCMAKE_BUILD_TYPE=Release)
run(${CMAKE_COMMAND} --build ${WORK_DIR}/build)
run(${WORK_DIR}/build/consumer_host ${WORK_DIR}/build/consumer_plugin.so)
message(STATUS "${LAST_OUTPUT}")
if(NOT LAST_OUTPUT MATCHES "models: 2")
  message(FATAL_ERROR "the host did not see the plug-in's two models: ${LAST_OUTPUT}")
endif()

# pkg-config: the same host compiled by hand.
set(ENV{PKG_CONFIG_PATH} ${prefix}/lib/pkgconfig)
execute_process(COMMAND pkg-config --cflags --libs ulk OUTPUT_VARIABLE flags
                OUTPUT_STRIP_TRAILING_WHITESPACE RESULT_VARIABLE rc)
if(NOT rc EQUAL 0)
  message(FATAL_ERROR "pkg-config does not know ulk")
endif()
execute_process(COMMAND pkg-config --variable=plugindir ulk OUTPUT_VARIABLE plugindir
                OUTPUT_STRIP_TRAILING_WHITESPACE)
file(REAL_PATH "${plugindir}" plugindir)
if(NOT plugindir STREQUAL "${prefix}/lib/ulk/plugins")
  message(FATAL_ERROR "plugindir is '${plugindir}'")
endif()
separate_arguments(flags UNIX_COMMAND "${flags}")
run(${CXX} -std=c++17 ${SOURCE_DIR}/host.cpp -o ${WORK_DIR}/pc_host ${flags}
    -Wl,-rpath,${prefix}/lib -ldl)
run(${WORK_DIR}/pc_host ${WORK_DIR}/build/consumer_plugin.so)
