// The user's settings.
#ifndef ZOR_PLATFORM_SYSTEM_ZORSETTINGREPOSITORY_H
#define ZOR_PLATFORM_SYSTEM_ZORSETTINGREPOSITORY_H

#include <string>

#include "ZORPlatformExport.h"
#include "platform/ZORPlatformAdditions.h"
#include "platform/system/ZORResult.h"
#include "platform/system/ZORString.h"
#include "platform/system/ZORUnicodeString.h"

class ZORSettingController;  // a dialogue's hold on a repository; this platform has none

/// The settings of one name, read afresh at each call. Repositories belong to the platform and live
/// until the process ends: callers never delete them.
class ZOR_PLATFORM_EXPORT ZORSettingRepository {
 public:
  /// @param inName       name of the repository.
  /// @param inMode       0; other values are accepted and mean the same.
  /// @param inAccess     1 for reading; other values are accepted and mean the same: nothing is
  ///                     ever written here.
  /// @param inController null.
  /// @return the repository, or null when there is no such repository or it cannot be read.
  static ZORSettingRepository* GetRepository(const char* inName, int inMode = 0, int inAccess = 1,
                                             ZORSettingController* inController = nullptr);
  virtual ~ZORSettingRepository();

  /// Reads one setting. Numbers and truth values are read as their text by the text forms; numbers
  /// in text as numbers. An int is read from a number without fraction within its range.
  /// @return S_OK; E_FAIL, the output unchanged, when the setting is missing or of a kind that does
  ///         not convert; E_INVALIDARG for a null argument.
  virtual HRESULT ReadSetting(const char* inName, ZORString* outValue) = 0;
  virtual HRESULT ReadSetting(const char* inName, ZORUnicodeString* outValue) = 0;
  /// Reads the first inCount numbers of an array; a single number is an array of one.
  /// @return as above; also E_FAIL when there are fewer numbers, E_INVALIDARG for a count below 1.
  virtual HRESULT ReadSetting(const char* inName, int* outValues, int inCount) = 0;

#if ZOR_PLATFORM_ADDITIONS
  virtual HRESULT ReadSetting(const char* inName, int* outValue) = 0;
  virtual HRESULT ReadSetting(const char* inName, double* outValue) = 0;
#endif
};

#endif
