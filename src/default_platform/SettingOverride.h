// Settings of this process alone.
#ifndef ZOR_DEFAULT_PLATFORM_SETTINGOVERRIDE_H
#define ZOR_DEFAULT_PLATFORM_SETTINGOVERRIDE_H

#include <string>

#include "ZORPlatformExport.h"

namespace ZORDefault {

/// While this lives, a setting of ZORSettingRepository has a value of its own in this process,
/// whether its file has one or not, and its repository exists. Of several for one setting the last
/// one counts. One thread at a time.
class ZOR_PLATFORM_EXPORT SettingOverride {
 public:
  SettingOverride(const std::string& inRepository, const std::string& inSetting, int inValue);
  ~SettingOverride();
  SettingOverride(const SettingOverride&) = delete;
  SettingOverride& operator=(const SettingOverride&) = delete;
};

}  // namespace ZORDefault

#endif
