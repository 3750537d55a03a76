// Codes of the file operations.
#ifndef ZOR_DEFAULT_PLATFORM_SYSTEM_FILERESULT_H
#define ZOR_DEFAULT_PLATFORM_SYSTEM_FILERESULT_H

#include "platform/system/ZORFile.h"

namespace ZORDefault {

/// The code of an errno value.
HRESULT FileResultOf(int inError);

}  // namespace ZORDefault

#endif
