# Cross-compiles for Windows x86-64. The library's own sources alone, on a host's own platform:
#   cmake -B build/mingw -G Ninja -DCMAKE_TOOLCHAIN_FILE=cmake/mingw-w64.cmake -DZOR_LIBRARY_OBJECTS_ONLY=ON
# Everything, on libraries that scripts/windows has built into ZOR_SYSROOT: the preset `windows`.
set(CMAKE_SYSTEM_NAME Windows)
set(CMAKE_SYSTEM_PROCESSOR x86_64)
set(CMAKE_C_COMPILER x86_64-w64-mingw32-gcc-posix)
set(CMAKE_CXX_COMPILER x86_64-w64-mingw32-g++-posix)
set(CMAKE_RC_COMPILER x86_64-w64-mingw32-windres)
set(CMAKE_CROSSCOMPILING_EMULATOR /usr/lib/wine/wine64)

# Programs are the build machine's, headers and libraries the target's.
set(ZOR_SYSROOT "" CACHE PATH "Libraries that were built for Windows")
list(APPEND CMAKE_TRY_COMPILE_PLATFORM_VARIABLES ZOR_SYSROOT)
set(CMAKE_FIND_ROOT_PATH /usr/x86_64-w64-mingw32 ${ZOR_SYSROOT})
set(ENV{PKG_CONFIG_LIBDIR} ${ZOR_SYSROOT}/lib/pkgconfig)
set(CMAKE_FIND_ROOT_PATH_MODE_PROGRAM NEVER)
set(CMAKE_FIND_ROOT_PATH_MODE_LIBRARY ONLY)
set(CMAKE_FIND_ROOT_PATH_MODE_INCLUDE ONLY)
set(CMAKE_FIND_ROOT_PATH_MODE_PACKAGE ONLY)
