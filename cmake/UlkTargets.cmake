# Helpers used inside this source tree: one per kind of target.
include(${CMAKE_CURRENT_LIST_DIR}/UlkPlugin.cmake)

# Folders in the build tree where modules land, so tests and tools can find them.
set(ULK_PLUGIN_OUTPUT_DIR ${CMAKE_BINARY_DIR}/plugins)
set(ULK_TEST_PLUGIN_OUTPUT_DIR ${CMAKE_BINARY_DIR}/test-plugins)

function(ulk_target_warnings target)
  target_compile_options(${target} PRIVATE -Wall -Wextra)
  if(ULK_WERROR)
    target_compile_options(${target} PRIVATE -Werror)
  endif()
endfunction()

# A sample plug-in, installed with the SDK.
function(ulk_add_sample_plugin name)
  ulk_add_plugin(${name} OUTPUT_DIRECTORY ${ULK_PLUGIN_OUTPUT_DIR} ${ARGN})
  ulk_target_warnings(${name})
  install(TARGETS ${name} LIBRARY DESTINATION ${CMAKE_INSTALL_LIBDIR}/ulk/plugins)
endfunction()

# A plug-in module used only by the tests.
function(ulk_add_test_plugin name)
  ulk_add_plugin(${name} OUTPUT_DIRECTORY ${ULK_TEST_PLUGIN_OUTPUT_DIR} SOURCES ${ARGN})
  ulk_target_warnings(${name})
  set_property(GLOBAL APPEND PROPERTY ULK_TEST_PLUGINS ${name})
endfunction()

# A command-line tool: a thin main over the library and tools/common.
function(ulk_add_tool name)
  add_executable(${name} ${ARGN})
  target_link_libraries(${name} PRIVATE ulk::ulk)
  if(TARGET ulk_tools_common)
    target_link_libraries(${name} PRIVATE ulk_tools_common)
  endif()
  ulk_target_warnings(${name})
  install(TARGETS ${name} RUNTIME DESTINATION ${CMAKE_INSTALL_BINDIR})
endfunction()
