// Files: access, writing, copying, joining paths.
#ifndef ZOR_PLATFORM_SYSTEM_ZORFILE_H
#define ZOR_PLATFORM_SYSTEM_ZORFILE_H

#include <cstddef>

#include "ZORPlatformExport.h"
#include "platform/ZORPlatformAdditions.h"
#include "platform/system/ZORResult.h"

#if ZOR_PLATFORM_ADDITIONS
/// Codes of the file operations below: negative, one for each common reason, others as E_FAIL.
enum ZORFileResult : HRESULT {
  kZORFileNotFound = static_cast<HRESULT>(0x80070002),
  kZORFileAccessDenied = static_cast<HRESULT>(0x80070005),
  kZORFileExists = static_cast<HRESULT>(0x80070050),
  kZORFileDiskFull = static_cast<HRESULT>(0x80070070),
  kZORFileBadPath = static_cast<HRESULT>(0x800700A1),
  kZORFileIsDirectory = static_cast<HRESULT>(0x8007010B),
};
#endif

/// @param inPath narrow path.
/// @param inMode 0: exists; 2: may be written; 4: may be read; or a sum of these.
/// @return 0 when all of it holds, else nonzero.
ZOR_PLATFORM_EXPORT int ZORFileAccess(const char* inPath, int inMode);

/// Opens a file.
/// @param inMode "rb", "wb" (made or emptied) or "ab".
/// @param outDescriptor set on success only; to be given to ZORFClose.
ZOR_PLATFORM_EXPORT HRESULT ZORFOpen(const wchar_t* inPath, const char* inMode, int* outDescriptor);

/// Writes all the bytes.
/// @param outWritten the number really written, also after a failure.
ZOR_PLATFORM_EXPORT HRESULT ZORFWrite(int inDescriptor, const void* inBytes, std::size_t inCount,
                                      std::size_t* outWritten);

ZOR_PLATFORM_EXPORT HRESULT ZORFClose(int inDescriptor);

/// Copies a file's bytes onto a path; an existing target is replaced only when the copy is
/// complete.
/// @param inFlags 0; 1 refuses an existing target.
ZOR_PLATFORM_EXPORT HRESULT ZORFCopy(const wchar_t* inSource, const wchar_t* inTarget, int inFlags);

/// Joins a directory and a file name with the file system's own separator where the directory does
/// not end in one.
/// @param outPath room for 260 bytes with the terminating zero.
/// @return S_OK; E_INVALIDARG when the result would not fit (outPath is then the empty string).
ZOR_PLATFORM_EXPORT HRESULT ZORMakePath(const char* inDirectory, const char* inFileName,
                                        char* outPath);

#endif
