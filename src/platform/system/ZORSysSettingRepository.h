// The settings that an administrator made for every user.
#ifndef ZOR_PLATFORM_SYSTEM_ZORSYSSETTINGREPOSITORY_H
#define ZOR_PLATFORM_SYSTEM_ZORSYSSETTINGREPOSITORY_H

#include "platform/system/ZORSettingRepository.h"

/// Like ZORSettingRepository, from the system's own folder.
class ZOR_PLATFORM_EXPORT ZORSysSettingRepository : public ZORSettingRepository {
 public:
  /// @return the repository (the platform's), or null when there is none of this name.
  static ZORSysSettingRepository* GetRepository(const char* inName);
};

#endif
