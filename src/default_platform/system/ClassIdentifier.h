// Identifiers made from names.
#ifndef ZOR_DEFAULT_PLATFORM_SYSTEM_CLASSIDENTIFIER_H
#define ZOR_DEFAULT_PLATFORM_SYSTEM_CLASSIDENTIFIER_H

#include <string_view>

#include "platform/system/ZORGuid.h"

namespace ZORDefault {

/// The identifier of the class or interface of a name: the same on every run and machine. It is the
/// name's 128-bit FNV-1a hash (G. Fowler, L. C. Noll, K.-P. Vo), most significant byte first.
GUID IdentifierOfName(std::string_view inName);

}  // namespace ZORDefault

#endif
