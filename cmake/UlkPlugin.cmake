# ulk_add_plugin(<name> [OUTPUT_DIRECTORY <dir>] SOURCES <files>...)
#
# Builds one ULK plug-in: a MODULE library named <name>.so (no "lib" prefix)
# that links against ulk::ulk and keeps every symbol hidden except the entry
# points marked ULK_PLUGIN_EXPORT. Shipped with the SDK, so that a plug-in
# outside this tree builds exactly as the ones inside it do.
function(ulk_add_plugin name)
  cmake_parse_arguments(ARG "" "OUTPUT_DIRECTORY" "SOURCES" ${ARGN})
  add_library(${name} MODULE ${ARG_SOURCES})
  target_link_libraries(${name} PRIVATE ulk::ulk)
  set_target_properties(${name} PROPERTIES
    PREFIX ""
    CXX_VISIBILITY_PRESET hidden
    VISIBILITY_INLINES_HIDDEN ON)
  if(ARG_OUTPUT_DIRECTORY)
    set_target_properties(${name} PROPERTIES LIBRARY_OUTPUT_DIRECTORY "${ARG_OUTPUT_DIRECTORY}")
  endif()
endfunction()
