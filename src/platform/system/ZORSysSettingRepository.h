// The settings that an administrator made for every user.
#ifndef ZOR_PLATFORM_SYSTEM_ZORSYSSETTINGREPOSITORY_H
#define ZOR_PLATFORM_SYSTEM_ZORSYSSETTINGREPOSITORY_H

#include "platform/system/ZORSettingRepository.h"

/// Like ZORSettingRepository, from the system's own folder.
class ZOR_PLATFORM_EXPORT ZORSysSettingRepository : public ZORSettingRepository {
 public:
  /// @param inMode 0; other values are accepted and mean the same.
  /// @return the repository (the platform's), or null when there is none of this name or it cannot
  ///         be read.
  static ZORSysSettingRepository* GetRepository(const char* inName, int inMode = 0);
  /// Reads the first inCount numbers of an attribute, as ReadSetting does.
  HRESULT ReadAttr(const char* inName, int* outValues, int inCount = 1);
};

#endif
