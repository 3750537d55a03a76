// Identifiers of interfaces and classes.
#ifndef ZOR_PLATFORM_SYSTEM_ZORGUID_H
#define ZOR_PLATFORM_SYSTEM_ZORGUID_H

#include "platform/ZORPlatformAdditions.h"

#ifdef _WIN32
#include <guiddef.h>
#else
#include <cstdint>
#include <cstring>

/// A 128-bit identifier.
typedef struct _GUID {
  std::uint32_t Data1;
  std::uint16_t Data2;
  std::uint16_t Data3;
  unsigned char Data4[8];
} GUID;
typedef GUID IID;
typedef GUID CLSID;

#if ZOR_PLATFORM_ADDITIONS
inline bool operator==(const GUID& inA, const GUID& inB) {
  return std::memcmp(&inA, &inB, sizeof(GUID)) == 0;
}
inline bool operator!=(const GUID& inA, const GUID& inB) { return !(inA == inB); }
#endif
#endif

#endif
