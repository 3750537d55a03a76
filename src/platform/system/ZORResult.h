// 32-bit signed result codes: negative means failure.
#ifndef ZOR_PLATFORM_SYSTEM_ZORRESULT_H
#define ZOR_PLATFORM_SYSTEM_ZORRESULT_H

#include <cstdint>

#ifdef _WIN32
typedef long HRESULT;  // same type as the system's own, so that both may be seen together
#else
typedef std::int32_t HRESULT;
#endif

#ifndef S_OK
#define S_OK (static_cast<HRESULT>(0))
#endif
#ifndef E_FAIL
#define E_FAIL (static_cast<HRESULT>(0x80004005))
#endif
#ifndef E_INVALIDARG
#define E_INVALIDARG (static_cast<HRESULT>(0x80070057))
#endif
#ifndef E_NOINTERFACE
#define E_NOINTERFACE (static_cast<HRESULT>(0x80004002))
#endif
#ifndef E_NOTIMPL
#define E_NOTIMPL (static_cast<HRESULT>(0x80004001))
#endif
#ifndef SUCCEEDED
#define SUCCEEDED(result) (static_cast<HRESULT>(result) >= 0)
#endif
#ifndef FAILED
#define FAILED(result) (static_cast<HRESULT>(result) < 0)
#endif

#endif
