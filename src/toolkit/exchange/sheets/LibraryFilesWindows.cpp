// The spreadsheet library opens files by the C library's fopen, which takes narrow text for that of
// the ANSI code page on Windows and no path beyond MAX_PATH. The linker puts these in its place.
#include <cstdio>

#include "foundation/WindowsCalls.h"

extern "C" {

std::FILE* __wrap_fopen(const char* inPath, const char* inMode) {
  return _wfopen(ZORFoundation::WidePath(inPath).c_str(), ZORFoundation::WideText(inMode).c_str());
}

std::FILE* __wrap_fopen64(const char* inPath, const char* inMode) {
  return __wrap_fopen(inPath, inMode);
}
}
