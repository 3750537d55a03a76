# Taken in by Embree's own CMakeLists.txt (CMAKE_PROJECT_embree3_INCLUDE). That takes a compiler for Windows for Visual C++
# unless CMake says that it is used like GCC, which it does not say of GCC itself.
set(CMAKE_CXX_COMPILER_FRONTEND_VARIANT GNU)
# Installed with the library, but left out of Debian's sources.
file(TOUCH ${CMAKE_CURRENT_SOURCE_DIR}/readme.pdf)

# Leaves out its resources, which windres does not read, as they are in UTF-16, and what meets rays with curves, which
# nothing asks for when it is built without them and which takes most of the time.
function(zor_leave_out_sources)
  foreach(target embree embree_sse42 embree_avx embree_avx2)
    get_target_property(sources ${target} SOURCES)
    get_target_property(folder ${target} SOURCE_DIR)
    list(FILTER sources INCLUDE REGEX "(embree\\.rc|/curve_intersector_virtual_[^/]*\\.cpp)$")
    list(TRANSFORM sources PREPEND ${folder}/ REGEX "^[^/]")
    set_source_files_properties(${sources} TARGET_DIRECTORY ${target} PROPERTIES HEADER_FILE_ONLY ON)
  endforeach()
endfunction()
cmake_language(DEFER CALL zor_leave_out_sources)
