# Taken in by Embree's own CMakeLists.txt (CMAKE_PROJECT_embree3_INCLUDE). That takes a compiler for Windows for Visual C++
# unless CMake says that it is used like GCC, which it does not say of GCC itself; and windres does not read its resources,
# which are in UTF-16.
set(CMAKE_CXX_COMPILER_FRONTEND_VARIANT GNU)
# Installed with the library, but left out of Debian's sources.
file(TOUCH ${CMAKE_CURRENT_SOURCE_DIR}/readme.pdf)
cmake_language(DEFER CALL
  set_source_files_properties kernels/embree.rc TARGET_DIRECTORY embree PROPERTIES HEADER_FILE_ONLY ON)
