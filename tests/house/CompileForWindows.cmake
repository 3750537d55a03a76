# Compiles a project's sources with MinGW-w64: cmake -D source=… -D binary=… -D toolchain=… -P CompileForWindows.cmake
find_program(compiler x86_64-w64-mingw32-g++-posix)
if(NOT compiler)
  message(STATUS "no compiler for Windows here")
  return()
endif()

execute_process(
  COMMAND ${CMAKE_COMMAND} -S ${source} -B ${binary} -G Ninja -DCMAKE_TOOLCHAIN_FILE=${toolchain}
    -DZOR_LIBRARY_OBJECTS_ONLY=ON -DZOR_WARNINGS_AS_ERRORS=ON
  COMMAND_ERROR_IS_FATAL ANY)
execute_process(COMMAND ${CMAKE_COMMAND} --build ${binary} COMMAND_ERROR_IS_FATAL ANY)

if(EXISTS ${source}/src/windows)
  file(GLOB_RECURSE entryPoint ${binary}/src/*/ZORLyraEntryPoint.cpp.obj)
  if(NOT entryPoint)
    message(FATAL_ERROR "the entry point was not compiled")
  endif()
endif()
