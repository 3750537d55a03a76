// The environment. Names and values are UTF-8.
#ifndef ZOR_FOUNDATION_ENVIRONMENT_H
#define ZOR_FOUNDATION_ENVIRONMENT_H

#include "ZORFoundationExport.h"

namespace ZORFoundation {

/// @return the value that a variable has now, null without one; not to be kept beyond a change of it.
ZOR_FOUNDATION_EXPORT const char* ReadEnvironment(const char* inName);

/// @param inValue null takes the variable away.
ZOR_FOUNDATION_EXPORT void WriteEnvironment(const char* inName, const char* inValue);

}  // namespace ZORFoundation

#endif
