# What a build for Windows needs besides: names without the prefix of Unix, and the compiler's own libraries, through which
# errors pass from one of our libraries to another, beside ours.
set(CMAKE_SHARED_LIBRARY_PREFIX "")
set(CMAKE_SHARED_MODULE_PREFIX "")
include_directories(SYSTEM ${ZOR_SYSROOT}/include)
add_compile_definitions(U_STATIC_IMPLEMENTATION)  # ICU and Xerces-C are linked in
find_library(ZLIB_LIBRARY libz.a)
set(ZOR_COMPILER_LIBRARIES)
foreach(name libgcc_s_seh-1.dll libstdc++-6.dll libwinpthread-1.dll)
  execute_process(COMMAND ${CMAKE_CXX_COMPILER} -print-file-name=${name}
    OUTPUT_VARIABLE file OUTPUT_STRIP_TRAILING_WHITESPACE COMMAND_ERROR_IS_FATAL ANY)
  if(NOT IS_ABSOLUTE "${file}")
    find_file(${name}_file ${name} PATHS /usr/x86_64-w64-mingw32/lib NO_CMAKE_FIND_ROOT_PATH REQUIRED)
    set(file ${${name}_file})
  endif()
  get_filename_component(file ${file} REALPATH)
  list(APPEND ZOR_COMPILER_LIBRARIES ${file})
  file(COPY ${file} DESTINATION ${CMAKE_RUNTIME_OUTPUT_DIRECTORY})
endforeach()
