# Taken in by the CAD kernel's own CMakeLists.txt (CMAKE_PROJECT_OCCT_INCLUDE) and at work once that has been read.
#
# Several sources of a package are compiled as one, in a third of the time. Those in SourcesOfTheirOwn.txt are not: they
# give the names, macros and types of a file to what another file means by them. Static libraries are told what they
# stand on, which that build says of shared ones alone, so that its package for CMake can be linked.
cmake_policy(VERSION 3.25)
set(ZOR_SOURCES_AT_ONCE 16)

# zor_group_sources(toolkit): names the group of each source that is to be compiled with others.
function(zor_group_sources inToolkit)
  file(STRINGS "${CMAKE_CURRENT_FUNCTION_LIST_DIR}/SourcesOfTheirOwn.txt" alone REGEX "^[^#]")
  get_target_property(sources ${inToolkit} SOURCES)
  list(FILTER sources INCLUDE REGEX "\\.cxx$")
  foreach(source IN LISTS sources)
    cmake_path(GET source STEM LAST_ONLY name)
    cmake_path(GET source PARENT_PATH folder)
    cmake_path(GET folder FILENAME package)
    # Counted before any is left out, so that one more in the list leaves the other groups as they are.
    math(EXPR count_${package} "${count_${package}} + 1")
    if(name IN_LIST alone OR package IN_LIST alone OR name MATCHES "_[0-9]+$")
      continue()
    endif()
    math(EXPR group "${count_${package}} / ${ZOR_SOURCES_AT_ONCE}")
    set_source_files_properties(${source} TARGET_DIRECTORY ${inToolkit} PROPERTIES UNITY_GROUP ${package}_${group})
  endforeach()
  set_target_properties(${inToolkit} PROPERTIES UNITY_BUILD ON UNITY_BUILD_MODE GROUP)
endfunction()

# zor_name_what_is_needed(toolkit): the toolkits that its file EXTERNLIB names and, once, the system's libraries.
function(zor_name_what_is_needed inToolkit)
  file(STRINGS "${PROJECT_SOURCE_DIR}/src/${inToolkit}/EXTERNLIB" needed REGEX "^TK")
  if(inToolkit STREQUAL "TKernel")
    set(needed ws2_32 psapi user32 gdi32 advapi32 ole32 windowscodecs winmm)
    # Its headers use M_PI, which is not the standard's.
    set_target_properties(TKernel PROPERTIES INTERFACE_COMPILE_DEFINITIONS "OCCT_STATIC_BUILD;_USE_MATH_DEFINES")
  endif()
  set_property(TARGET ${inToolkit} APPEND PROPERTY INTERFACE_LINK_LIBRARIES ${needed})
endfunction()

function(zor_finish_toolkits)
  foreach(toolkit IN LISTS BUILD_TOOLKITS)
    zor_group_sources(${toolkit})
    zor_name_what_is_needed(${toolkit})
  endforeach()
endfunction()
cmake_language(DEFER CALL zor_finish_toolkits)
