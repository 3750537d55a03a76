// The errors that the platform raises. The library raises none of its own and catches none of
// these.
#ifndef ZOR_PLATFORM_SYSTEM_ZORERRORS_H
#define ZOR_PLATFORM_SYSTEM_ZORERRORS_H

#include <stdexcept>
#include <string>

#include "ZORPlatformExport.h"

/// A broken precondition that the caller cannot sensibly go on from, such as a list index out of
/// range.
class ZOR_PLATFORM_EXPORT ZORFatalError : public std::runtime_error {
 public:
  explicit ZORFatalError(const std::string& inMessage);
  ~ZORFatalError() override;
};

/// A call was made through an interface handle that refers to nothing.
class ZOR_PLATFORM_EXPORT ZORNullVarError : public std::runtime_error {
 public:
  ZORNullVarError();
  ~ZORNullVarError() override;
};

/// Raises ZORNullVarError; called by every interface handle before a call through nothing.
[[noreturn]] ZOR_PLATFORM_EXPORT void ThrowErrorNullVar();

#endif
