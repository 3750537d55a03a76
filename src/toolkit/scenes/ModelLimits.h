// The limits of reading a model that users set.
#ifndef ZOR_TOOLKIT_SCENES_MODEL_LIMITS_H
#define ZOR_TOOLKIT_SCENES_MODEL_LIMITS_H

#include <optional>

#include "ZORToolkitExport.h"

namespace ZORToolkit {

/// A limit that is given, else that of the settings "ModelReading".
/// @param inName    what the user calls it, for the UsageError that is raised for a limit below 1
/// or
///                  above a million.
/// @param inSetting "LimitTime" in seconds or "LimitMemory" in megabytes.
/// @return 0 without either: the limit follows from the size of the file.
ZOR_TOOLKIT_EXPORT long long ModelLimit(const char* inName, const std::optional<long long>& inGiven,
                                        const char* inSetting);

}  // namespace ZORToolkit

#endif
